#include "platform/ui/PopoverPlacement.h"

#include "platform/ui/Theme.h"

#include <algorithm>
#include <cmath>
#include <optional>

namespace platform {
namespace {

bool allows(ArrowDirection permitted, ArrowDirection side) {
    return permitted == ArrowDirection::any ||
           (static_cast<unsigned>(permitted) & static_cast<unsigned>(side)) != 0;
}

bool isHorizontal(ArrowDirection side) {
    return side == ArrowDirection::left || side == ArrowDirection::right;
}

bool fits(ArrowDirection side, Rect anchor, Size panel, Rect area) {
    switch (side) {
    case ArrowDirection::up:
        return anchor.maxY() + popoverArrowHeight + panel.height <= area.maxY();
    case ArrowDirection::down:
        return anchor.y - popoverArrowHeight - panel.height >= area.y;
    case ArrowDirection::left:
        return anchor.maxX() + popoverArrowHeight + panel.width <= area.maxX();
    case ArrowDirection::right:
        return anchor.x - popoverArrowHeight - panel.width >= area.x;
    case ArrowDirection::any:
        break;
    }
    return false;
}

double within(double value, double low, double high) {
    return std::clamp(value, low, std::max(low, high));
}

PopoverPlace standAt(ArrowDirection side, Rect anchor, Size panel, Rect area) {
    PopoverPlace place;
    place.arrow = side;
    const double keepOff = Theme::overlayCorner + popoverArrowHalfBase;
    double x = within(anchor.midX() - panel.width / 2, area.x, area.maxX() - panel.width);
    double y = within(anchor.midY() - panel.height / 2, area.y, area.maxY() - panel.height);
    if (side == ArrowDirection::up)
        y = anchor.maxY() + popoverArrowHeight;
    else if (side == ArrowDirection::down)
        y = anchor.y - popoverArrowHeight - panel.height;
    else if (side == ArrowDirection::left)
        x = anchor.maxX() + popoverArrowHeight;
    else
        x = anchor.x - popoverArrowHeight - panel.width;
    place.panel = {std::round(x), std::round(y), panel.width, panel.height};
    place.arrowAt = isHorizontal(side)
                        ? within(anchor.midY() - place.panel.y, keepOff, panel.height - keepOff)
                        : within(anchor.midX() - place.panel.x, keepOff, panel.width - keepOff);
    return place;
}

std::optional<PopoverPlace> standBeside(Rect anchor, Size panel, Rect area,
                                        ArrowDirection permitted) {
    for (const ArrowDirection side :
         {ArrowDirection::up, ArrowDirection::down, ArrowDirection::left, ArrowDirection::right})
        if (allows(permitted, side) && fits(side, anchor, panel, area))
            return standAt(side, anchor, panel, area);
    return std::nullopt;
}

} // namespace

PopoverPlace placePopover(Rect anchor, Size panel, Rect area, ArrowDirection permitted) {
    // What is scrolled out of sight is pointed at where it still shows.
    const double left = within(anchor.x, area.x, area.maxX());
    const double top = within(anchor.y, area.y, area.maxY());
    const Rect seen{left, top, within(anchor.maxX(), left, area.maxX()) - left,
                    within(anchor.maxY(), top, area.maxY()) - top};
    if (const auto beside = standBeside(seen, panel, area, permitted))
        return *beside;
    const Rect middle{seen.midX(), seen.midY(), 0, 0};
    if (const auto beside = standBeside(middle, panel, area, permitted))
        return *beside;
    if (const auto beside = standBeside(seen, panel, area, ArrowDirection::any))
        return *beside;
    PopoverPlace over;
    over.panel = {
        std::round(within(seen.midX() - panel.width / 2, area.x, area.maxX() - panel.width)),
        std::round(within(seen.midY() - panel.height / 2, area.y, area.maxY() - panel.height)),
        panel.width, panel.height};
    return over;
}

} // namespace platform
