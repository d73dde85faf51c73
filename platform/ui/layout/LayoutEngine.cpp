#include "platform/ui/layout/LayoutEngine.h"

#include "platform/ui/layout/EngineState.h"

#include <algorithm>
#include <cmath>

namespace platform {

using layout::Solver;

void LayoutEngine::State::markDirty() {
    if (isDirty)
        return;
    isDirty = true;
    if (dirtied)
        dirtied();
}

void LayoutEngine::State::wantRead(LayoutRecord& record) {
    if (!record.isChanged) {
        record.isChanged = true;
        changedItems.push_back(record.link);
    }
    markDirty();
}

void LayoutEngine::State::wantRow(const LayoutConstraint::Pointer& constraint) {
    if (constraint->impl().pending)
        return;
    constraint->impl().pending = true;
    pendingConstraints.push_back(constraint);
    markDirty();
}

void LayoutEngine::State::dropRow(LayoutConstraint::Impl& constraint) {
    constraint.pending = false;
    if (constraint.row == LayoutRecord::noRow)
        return;
    constraints[static_cast<std::size_t>(constraint.row)] = nullptr;
    release(constraint.row);
}

LayoutEngine::LayoutEngine(double pixelsPerPoint) : state_(std::make_unique<State>(*this)) {
    setPixelsPerPoint(pixelsPerPoint);
}

LayoutEngine::~LayoutEngine() {
    for (const auto& record : state_->records) {
        record->link->engine = nullptr;
        record->link->record = nullptr;
        for (const auto& constraint : record->link->active) {
            constraint->impl().row = LayoutRecord::noRow;
            constraint->impl().pending = false;
        }
    }
}

void LayoutEngine::addItem(LayoutItem& item) {
    LayoutLink& link = *item.layoutLink();
    if (link.engine == this)
        return;
    if (link.engine)
        link.engine->removeItem(item);
    auto record = std::make_unique<LayoutRecord>();
    record->link = item.layoutLink();
    record->item = &item;
    record->index = state_->records.size();
    record->serial = ++state_->serials;
    LayoutItem* const parent = item.layoutParent();
    if (parent && parent->layoutLink()->engine == this) {
        record->parent = parent->layoutLink()->record;
        record->parent->children.push_back(record.get());
        record->depth = record->parent->depth + 1;
    }
    for (LayoutRecord::Span& span : record->spans) {
        span.offset = state_->solver.addVariable(Solver::Kind::position);
        span.size = state_->solver.addVariable(Solver::Kind::size);
        for (const layout::Variable variable : {span.offset, span.size}) {
            const auto index = static_cast<std::size_t>(variable);
            state_->owners.resize(std::max(state_->owners.size(), index + 1));
            state_->owners[index] = record.get();
        }
    }
    link.engine = this;
    link.record = record.get();
    record->mustHandOut = true;
    state_->wantRead(*record);
    state_->records.push_back(std::move(record));
    for (const auto& constraint : link.active)
        if (constraint->impl().engine() == this)
            state_->wantRow(constraint);
}

void LayoutEngine::removeItem(LayoutItem& item) {
    LayoutLink& link = *item.layoutLink();
    if (link.engine != this)
        return;
    LayoutRecord& record = *link.record;
    for (const auto& constraint : link.active)
        if (constraint->impl().engine() == this)
            state_->dropRow(constraint->impl());
    state_->releaseOwnRows(record);
    for (const LayoutRecord::Span& span : record.spans)
        for (const layout::Variable variable : {span.offset, span.size}) {
            state_->owners[static_cast<std::size_t>(variable)] = nullptr;
            state_->solver.removeVariable(variable);
        }
    for (LayoutRecord* const child : record.children)
        child->parent = nullptr;
    if (record.parent)
        std::erase(record.parent->children, &record);
    link.engine = nullptr;
    link.record = nullptr;
    auto& records = state_->records;
    const std::size_t index = record.index;
    std::swap(records[index], records.back());
    records[index]->index = index;
    records.pop_back();
    state_->markDirty();
}

void LayoutEngine::itemChanged(LayoutItem& item) {
    const LayoutLink& link = *item.layoutLink();
    if (link.engine != this)
        return;
    link.record->mustHandOut = true;
    link.record->askedWidth = -1;
    state_->wantRead(*link.record);
}

void LayoutEngine::addConstraint(const LayoutConstraint::Pointer& constraint) {
    state_->wantRow(constraint);
}

void LayoutEngine::removeConstraint(const LayoutConstraint& constraint) {
    state_->dropRow(constraint.impl());
    state_->markDirty();
}

void LayoutEngine::constraintChanged(const LayoutConstraint& constraint) {
    const LayoutConstraint::Impl& impl = constraint.impl();
    if (impl.row == LayoutRecord::noRow)
        return;
    state_->solver.setConstant(impl.row, impl.constant);
    state_->solver.setStrength(impl.row, impl.strength());
    state_->markDirty();
}

void LayoutEngine::setRootSize(Size size) {
    if (state_->rootSize == size)
        return;
    state_->rootSize = size;
    for (const auto& record : state_->records)
        if (!record->parent)
            state_->wantRead(*record);
}

void LayoutEngine::setRightToLeft(bool rightToLeft) {
    if (state_->isRightToLeft == rightToLeft)
        return;
    state_->isRightToLeft = rightToLeft;
    state_->rebuildRows();
}

void LayoutEngine::setPixelsPerPoint(double pixelsPerPoint) {
    state_->pixelsPerPoint = pixelsPerPoint > 0 ? pixelsPerPoint : 1;
    // Contents that wrap are asked again as well: their width in whole pixels is another.
    for (const auto& record : state_->records) {
        record->askedWidth = -1;
        state_->wantRead(*record);
    }
}

void LayoutEngine::setOnNeedsSolve(std::function<void()> dirtied) {
    state_->dirtied = std::move(dirtied);
}

bool LayoutEngine::needsSolve() const {
    return state_->isDirty;
}

void LayoutEngine::solve() {
    // An item that is being handed its frame may ask for layout: its turn comes afterwards.
    if (!state_->isDirty || state_->isSolving)
        return;
    state_->isSolving = true;
    state_->isDirty = false;
    state_->readPending();
    state_->solveRows();
    state_->reportConflicts();
    state_->collectFrames();
    state_->handOut();
    state_->isSolving = false;
}

} // namespace platform
