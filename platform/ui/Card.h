#pragma once

#include "platform/ui/PopoverPlacement.h"
#include "platform/ui/View.h"

namespace platform {

/// The white, rounded ground of an alert or a sheet, with its shadow and, for a popover, its arrow.
/// The view is larger than what stands on it: by `reach` on every side, for the shadow.
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
    struct Painting;
    Painting& painting() const;
};

} // namespace platform
