#include "platform/base/Log.h"
#include "platform/ui/layout/EngineState.h"

#include <algorithm>
#include <cmath>

namespace platform {

namespace {

/// A height that depends on a width may change that width in turn; after so many rounds the last
/// answer stands.
constexpr int wrapPasses = 4;
/// In pixels: differences of rounding, so that an edge computed on two ways ends on one pixel.
constexpr double pixelNoise = 1e-5;

} // namespace

void LayoutEngine::State::readPending() {
    // What items change while they are read waits for the next pass.
    const auto items = std::exchange(changedItems, {});
    for (const auto& link : items) {
        if (link->engine != &engine)
            continue;
        LayoutRecord& record = *link->record;
        record.isChanged = false;
        readItem(record);
        if (!record.isMoved) {
            record.isMoved = true;
            movedItems.push_back(link);
        }
        if (!record.isGiven && !record.isResized) {
            record.isResized = true;
            resizedItems.push_back(link);
        }
    }
    for (const auto& constraint : std::exchange(pendingConstraints, {})) {
        LayoutConstraint::Impl& impl = constraint->impl();
        if (!impl.pending || impl.engine() != &engine)
            continue;
        impl.pending = false;
        addRow(*constraint);
    }
}

void LayoutEngine::State::solveRows() {
    solver.solve();
    noteChanged();
    for (int pass = 0; pass < wrapPasses && askHeights(); ++pass) {
        solver.solve();
        noteChanged();
    }
    if (solver.isCutShort())
        platformLog(LogLevel::warning, "Layout stopped before its best answer");
}

void LayoutEngine::State::noteChanged() {
    for (const layout::Variable variable : solver.changed()) {
        LayoutRecord* const record = owners[static_cast<std::size_t>(variable)];
        if (!record)
            continue;
        if (!record->isMoved) {
            record->isMoved = true;
            movedItems.push_back(record->link);
        }
        if (!record->isGiven && !record->isResized &&
            variable == record->span(Axis::horizontal).size) {
            record->isResized = true;
            resizedItems.push_back(record->link);
        }
    }
}

/// Asks the contents whose width changed for their height. True when an answer was another than
/// before.
bool LayoutEngine::State::askHeights() {
    bool isAnyNew = false;
    for (const auto& link : std::exchange(resizedItems, {})) {
        if (link->engine != &engine)
            continue;
        LayoutRecord& record = *link->record;
        record.isResized = false;
        // Rounding may take up to a pixel from the width that a text gets.
        const double width =
            std::floor(value(record.span(Axis::horizontal).size) * pixelsPerPoint + pixelNoise) /
            pixelsPerPoint;
        if (width == record.askedWidth)
            continue;
        record.askedWidth = width;
        const double height = record.item->layoutHeightForWidth(width);
        if (height == record.wrappedHeight || (height < 0 && record.wrappedHeight < 0))
            continue;
        record.wrappedHeight = height;
        readItem(record);
        isAnyNew = true;
    }
    return isAnyNew;
}

void LayoutEngine::State::reportConflicts() {
    std::vector<LayoutConstraint*> current;
    for (const auto& conflict : solver.conflicts())
        if (LayoutConstraint* const loser = constraints[static_cast<std::size_t>(conflict.row)])
            current.push_back(loser);
    std::erase_if(reportedConflicts, [&](const auto& weak) {
        const auto reported = weak.lock();
        return std::find(current.begin(), current.end(), reported.get()) == current.end();
    });
    if (rootSize.width <= 0 || rootSize.height <= 0)
        return;
    for (const auto& conflict : solver.conflicts()) {
        LayoutConstraint* const loser = constraints[static_cast<std::size_t>(conflict.row)];
        if (!loser || std::any_of(reportedConflicts.begin(), reportedConflicts.end(),
                                  [&](const auto& weak) { return weak.lock().get() == loser; }))
            continue;
        reportedConflicts.push_back(loser->weak_from_this());
        std::vector<std::string> against;
        for (const layout::Row row : conflict.against)
            if (const auto index = static_cast<std::size_t>(row);
                index < constraints.size() && constraints[index])
                against.push_back(description(*constraints[index]));
        platformLog(LogLevel::warning, "Layout constraint %@ gives way, against %@", *loser,
                    against);
    }
}

double LayoutEngine::State::toPixel(double value) const {
    return std::floor(value * pixelsPerPoint + 0.5 + pixelNoise) / pixelsPerPoint;
}

void LayoutEngine::State::collectFrames() {
    ++passes;
    const auto moved = std::exchange(movedItems, {});
    std::vector<LayoutRecord*> order;
    for (const auto& link : moved)
        if (link->engine == &engine)
            order.push_back(link->record);
    std::stable_sort(order.begin(), order.end(), [](const LayoutRecord* a, const LayoutRecord* b) {
        return a->depth < b->depth;
    });
    for (LayoutRecord* const record : order)
        place(*record);
}

/// Rounds edges, not sizes: two items that share an edge share its pixel.
void LayoutEngine::State::place(LayoutRecord& record) {
    record.isMoved = false;
    if (record.placedIn == passes)
        return;
    record.placedIn = passes;
    const Point oldOrigin = record.origin;
    const double oldWidth = record.width;
    record.origin = {};
    record.width = value(record.span(Axis::horizontal).size);
    if (!record.isGiven)
        placeSolved(record);
    record.mustHandOut = false;
    // In mirror image, children hang on the other edge.
    if (record.origin != oldOrigin || (isRightToLeft && record.width != oldWidth))
        for (LayoutRecord* const child : record.children)
            place(*child);
}

void LayoutEngine::State::placeSolved(LayoutRecord& record) {
    const LayoutRecord::Span& x = record.span(Axis::horizontal);
    const LayoutRecord::Span& y = record.span(Axis::vertical);
    const Point from = record.parent->origin;
    const double left =
        isRightToLeft ? record.parent->width - value(x.offset) - record.width : value(x.offset);
    record.origin = {from.x + left, from.y + value(y.offset)};
    const Point corner{toPixel(record.origin.x), toPixel(record.origin.y)};
    const Point end{toPixel(record.origin.x + std::max(0.0, record.width)),
                    toPixel(record.origin.y + std::max(0.0, value(y.size)))};
    const Rect frame{corner.x - toPixel(from.x), corner.y - toPixel(from.y), end.x - corner.x,
                     end.y - corner.y};
    if (record.mustHandOut || frame != record.handedOut)
        frames.emplace_back(record.link, frame);
    record.handedOut = frame;
}

void LayoutEngine::State::handOut() {
    for (const auto& [link, frame] : std::exchange(frames, {}))
        if (link->engine == &engine)
            link->item->setSolvedFrame(frame);
}

} // namespace platform
