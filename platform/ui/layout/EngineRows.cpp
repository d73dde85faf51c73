#include "platform/ui/layout/EngineState.h"

#include <algorithm>
#include <cmath>

namespace platform {

using layout::Row;
using layout::Strength;
using layout::Term;

namespace {

/// A content's size is a wish, however strong: it gives way to what is required, without a word.
float contentPriority(LayoutPriority priority) {
    return std::clamp(priority, 0.0F, std::nextafter(layout::required, 0.0F));
}

double notNegative(double size) {
    return size > 0 ? size : 0;
}

Axis axisOf(LayoutAttribute attribute) {
    switch (attribute) {
    case LayoutAttribute::top:
    case LayoutAttribute::bottom:
    case LayoutAttribute::height:
    case LayoutAttribute::centerY:
        return Axis::vertical;
    default:
        return Axis::horizontal;
    }
}

bool isReading(LayoutAttribute attribute) {
    return attribute == LayoutAttribute::leading || attribute == LayoutAttribute::trailing;
}

/// Where the attribute stands between the item's leading (top) edge, 0, and its trailing one, 1.
double placeWithin(LayoutAttribute attribute, bool isRightToLeft) {
    switch (attribute) {
    case LayoutAttribute::left:
        return isRightToLeft ? 1 : 0;
    case LayoutAttribute::right:
        return isRightToLeft ? 0 : 1;
    case LayoutAttribute::trailing:
    case LayoutAttribute::bottom:
        return 1;
    case LayoutAttribute::centerX:
    case LayoutAttribute::centerY:
        return 0.5;
    default:
        return 0;
    }
}

const LayoutRecord* nearestCommon(const LayoutRecord* a, const LayoutRecord* b) {
    while (a != b) {
        if (!a || !b)
            return nullptr;
        if (a->depth >= b->depth)
            a = a->parent;
        else
            b = b->parent;
    }
    return a;
}

} // namespace

void LayoutEngine::State::hold(Row& row, std::initializer_list<Term> wanted, double constant,
                               Strength strength, std::uint64_t age) {
    if (row == LayoutRecord::noRow) {
        row = solver.addRow({wanted.begin(), wanted.size()}, constant, strength, age);
        return;
    }
    solver.setConstant(row, constant);
    solver.setStrength(row, strength);
}

void LayoutEngine::State::release(Row& row) {
    if (row != LayoutRecord::noRow)
        solver.removeRow(row);
    row = LayoutRecord::noRow;
}

void LayoutEngine::State::releaseOwnRows(LayoutRecord& record) {
    for (LayoutRecord::Span& span : record.spans)
        for (Row* const row : {&span.givenOffset, &span.givenSize, &span.content})
            release(*row);
}

void LayoutEngine::State::readItem(LayoutRecord& record) {
    const bool isGiven = !record.parent || !record.item->isLaidOutByConstraints();
    if (isGiven != record.isGiven)
        releaseOwnRows(record);
    record.isGiven = isGiven;
    if (isGiven) {
        readGiven(record);
        return;
    }
    const Size natural = record.item->layoutIntrinsicSize();
    readContent(record, Axis::horizontal, natural.width);
    readContent(record, Axis::vertical,
                record.wrappedHeight >= 0 ? record.wrappedHeight : natural.height);
}

void LayoutEngine::State::readGiven(LayoutRecord& record) {
    const Rect frame =
        record.parent ? record.item->handFrame() : Rect{0, 0, rootSize.width, rootSize.height};
    const Strength always{layout::required, layout::required};
    LayoutRecord::Span& x = record.span(Axis::horizontal);
    LayoutRecord::Span& y = record.span(Axis::vertical);
    hold(x.givenSize, {{x.size, 1}}, notNegative(frame.width), always, 0);
    hold(y.givenSize, {{y.size, 1}}, notNegative(frame.height), always, 0);
    hold(y.givenOffset, {{y.offset, 1}}, frame.y, always, 0);
    if (isRightToLeft && record.parent)
        hold(x.givenOffset,
             {{record.parent->span(Axis::horizontal).size, 1}, {x.offset, -1}, {x.size, -1}},
             frame.x, always, 0);
    else
        hold(x.givenOffset, {{x.offset, 1}}, frame.x, always, 0);
}

void LayoutEngine::State::readContent(LayoutRecord& record, Axis axis, double natural) {
    LayoutRecord::Span& span = record.span(axis);
    const Strength strength{contentPriority(record.item->layoutCompressionResistance(axis)),
                            contentPriority(record.item->layoutHugging(axis))};
    if (natural >= 0)
        hold(span.content, {{span.size, 1}}, natural, strength, record.serial);
    else
        release(span.content);
}

/// Adds factor times the attribute's value in the coordinates of `within`: in reading direction
/// (from the leading edge), or else from left to right.
void LayoutEngine::State::appendEnd(const LayoutRecord& record, LayoutAttribute attribute,
                                    const LayoutRecord* within, bool isReadingDirection,
                                    double factor) {
    const Axis axis = axisOf(attribute);
    const LayoutRecord::Span& span = record.span(axis);
    if (attribute == LayoutAttribute::width || attribute == LayoutAttribute::height) {
        terms.push_back({span.size, factor});
        return;
    }
    double sign = factor;
    if (axis == Axis::horizontal && isRightToLeft && !isReadingDirection) {
        const LayoutRecord* root = &record;
        while (root != within && root->parent)
            root = root->parent;
        terms.push_back({root->span(axis).size, factor});
        sign = -factor;
    }
    const double place = placeWithin(attribute, isRightToLeft);
    if (place != 0)
        terms.push_back({span.size, sign * place});
    for (const LayoutRecord* at = &record; at && at != within; at = at->parent)
        terms.push_back({at->span(axis).offset, sign});
}

void LayoutEngine::State::addRow(LayoutConstraint& constraint) {
    LayoutConstraint::Impl& impl = constraint.impl();
    const LayoutRecord* const first = impl.first.link->record;
    const LayoutRecord* const second = impl.hasSecond() ? impl.second.link->record : nullptr;
    const LayoutRecord* const within = second ? nearestCommon(first, second) : first->parent;
    const bool isReadingDirection =
        isReading(impl.first.attribute) || (second && isReading(impl.second.attribute));
    terms.clear();
    if (impl.first.attribute != LayoutAttribute::none)
        appendEnd(*first, impl.first.attribute, within, isReadingDirection, 1);
    if (second)
        appendEnd(*second, impl.second.attribute, within, isReadingDirection, -impl.multiplier);
    impl.row = solver.addRow(terms, impl.constant, impl.strength(), impl.activation);
    const auto index = static_cast<std::size_t>(impl.row);
    constraints.resize(std::max(constraints.size(), index + 1));
    constraints[index] = &constraint;
}

/// Takes everything that was said in terms of left and right back, to say it again mirrored.
void LayoutEngine::State::rebuildRows() {
    for (const auto& record : records) {
        releaseOwnRows(*record);
        wantRead(*record);
        for (const auto& constraint : record->link->active)
            if (constraint->impl().engine() == &engine && !constraint->impl().pending) {
                dropRow(constraint->impl());
                wantRow(constraint);
            }
    }
}

} // namespace platform
