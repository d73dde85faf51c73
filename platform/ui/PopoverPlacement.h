#pragma once

#include "platform/ui/AlertController.h"
#include "platform/ui/Geometry.h"

namespace platform {

/// How high the arrow of a popover stands out, and half of its base.
inline constexpr double popoverArrowHeight = 11;
inline constexpr double popoverArrowHalfBase = 11;

/// Where a popover stands.
struct PopoverPlace {
    Rect panel;
    /// The side to which the arrow points; `any` where there is no arrow.
    ArrowDirection arrow = ArrowDirection::any;
    /// Of the arrow's tip along that side of the panel, from its left or top.
    double arrowAt = 0;
};

/// Beside `anchor`, inside `area`, on a side that `permitted` allows and that has the room. An
/// anchor too large to stand beside is pointed at in its middle; without any room the popover
/// stands over it without an arrow.
PopoverPlace placePopover(Rect anchor, Size panel, Rect area, ArrowDirection permitted);

} // namespace platform
