#pragma once

#include "platform/ui/layout/LayoutItem.h"

#include <memory>

namespace platform {

/// One window's layout: takes the items of a tree and the active constraints between them, and
/// solves them for the root's size. Knows no widgets. Changes are cheap and only mark; solve() does
/// the work, incrementally where it can. Main thread.
class LayoutEngine {
public:
    /// `pixelsPerPoint` is what solved frames are rounded to.
    explicit LayoutEngine(double pixelsPerPoint = 1);
    ~LayoutEngine();
    LayoutEngine(const LayoutEngine&) = delete;
    LayoutEngine& operator=(const LayoutEngine&) = delete;

    void addItem(LayoutItem& item);
    /// Takes the item's constraints out of the solution; they come back with the item.
    void removeItem(LayoutItem& item);
    /// Its intrinsic size, priorities, hand frame or kind of layout changed.
    void itemChanged(LayoutItem& item);
    void addConstraint(const LayoutConstraint::Pointer& constraint);
    void removeConstraint(const LayoutConstraint& constraint);
    /// Its constant or its priority changed.
    void constraintChanged(const LayoutConstraint& constraint);

    void setRootSize(Size size);
    void setRightToLeft(bool rightToLeft);
    void setPixelsPerPoint(double pixelsPerPoint);

    bool needsSolve() const;
    /// Solves what changed and hands every item whose frame changed its new one.
    void solve();

private:
    struct State;
    std::unique_ptr<State> state_;
};

} // namespace platform
