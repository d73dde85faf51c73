#pragma once

#include "platform/ui/layout/LayoutEngine.h"

namespace platform {

class View;

// Where View and the layout code meet.
//
// View's implementation is the view's LayoutItem (its layoutView() answers the view) and does this:
// - Its subtree enters a window: addItem() of the window's engine for every view, parents first.
//   Leaves it: removeItem() for every view of the subtree. A move within the window is both.
// - Intrinsic size, priorities, hand frame or kind of layout change: itemChanged() of the engine
//   that it is in (layoutEngine()), nothing outside any.
// - setHidden, and a child that leaves its parent: the two calls at the end of this page.
// - Destruction needs nothing: the item's destructor takes it out of engine and constraints.
// Window tells its engine size, direction and pixels, and schedules a pass when the engine says
// that it needs one (setOnNeedsSolve).
//
// Constraints keep no views. A constraint may be activated at any time; it sleeps until both its
// views stand in one window, sleeps again when one of them leaves, and is deactivated when one
// dies. While it is active it is kept alive by its views, so nobody else needs to hold it.

/// The item through which `view` takes part in layout. Implemented by View.
LayoutItem& layoutItemOf(View& view);

/// To be called by View after `child` was hidden or shown: a stack view closes or opens its gap.
void stackChildChangedHidden(View& child);
/// To be called by View after `child` left `formerParent` by any way but the stack's own
/// removeArrangedSubview: a stack view forgets it.
void stackChildLeft(View& formerParent, View& child);

} // namespace platform
