#pragma once

#include "platform/ui/layout/LayoutItem.h"

#include <functional>
#include <memory>

namespace platform {

/// One window's layout: takes the items of a tree and the active constraints between them, and
/// solves them for the root's size. A natural size is a wish, however high its priority: it gives
/// way to requirements without a word. What nothing determines is as small and as near to the
/// parent's leading top corner as it may be; of equal wishes the oldest wins. Knows no widgets.
/// Changes are cheap and only mark; solve() does the work, incrementally where it can. Main thread.
class LayoutEngine {
public:
    /// `pixelsPerPoint` is what solved frames are rounded to.
    explicit LayoutEngine(double pixelsPerPoint = 1);
    ~LayoutEngine();
    LayoutEngine(const LayoutEngine&) = delete;
    LayoutEngine& operator=(const LayoutEngine&) = delete;

    /// A subtree comes in parent first; the active constraints that mention the item wake up once
    /// both their ends are here. To move an item in the tree, remove its subtree and add it again.
    void addItem(LayoutItem& item);
    /// Takes the item's constraints out of the solution; they come back with the item. The items
    /// below it have to leave as well, before the next solve().
    void removeItem(LayoutItem& item);
    /// Its intrinsic size, priorities, hand frame or kind of layout changed. The next solve() hands
    /// it its frame again, changed or not.
    void itemChanged(LayoutItem& item);

    /// Called by LayoutConstraint: an active constraint whose two ends are here.
    void addConstraint(const LayoutConstraint::Pointer& constraint);
    void removeConstraint(const LayoutConstraint& constraint);
    /// Its constant or its priority changed.
    void constraintChanged(const LayoutConstraint& constraint);

    /// The size of every item without a parent. Conflicts are not logged while it is empty: a
    /// window that has no area yet contradicts every margin.
    void setRootSize(Size size);
    void setRightToLeft(bool rightToLeft);
    void setPixelsPerPoint(double pixelsPerPoint);

    /// `dirtied` is called when a change makes needsSolve() true: the time to schedule a pass.
    void setOnNeedsSolve(std::function<void()> dirtied);
    bool needsSolve() const;
    /// Solves what changed and hands every item whose frame changed its new one, parents first.
    /// What items change while they are handed their frames waits for the next solve().
    void solve();

private:
    struct State;
    std::unique_ptr<State> state_;
};

} // namespace platform
