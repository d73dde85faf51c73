#pragma once

#include "platform/ui/PopoverPlacement.h"
#include "platform/ui/View.h"

namespace platform {

/// The white, rounded ground of an alert or a sheet, with its shadow and, for a popover, its arrow.
/// With a shadow the view is larger than what stands on it: by `reach` on every side.
class Card : public View {
public:
    static constexpr double reach = 48;
    /// Cards that stand close together share one shadow behind all of them.
    enum class Look { whole, groundOnly, shadowOnly };

    explicit Card(Look look = Look::whole);
    /// Puts the ground itself at `ground` (the parent's coordinates).
    void setGround(Rect ground);
    /// The ground in this view's coordinates.
    Rect ground() const;
    void setArrow(ArrowDirection side, double at);

private:
    /// Without a shadow nothing reaches over what stands beside the ground, nor takes its clicks.
    double margin() const;

    struct Painting;
    Painting& painting() const;
};

} // namespace platform
