#include "platform/documents/list/RowGeometry.h"

#include "platform/ui/Theme.h"

#include <cmath>

namespace platform {
namespace {

constexpr double circleEdge = 24;
constexpr double badgeEdge = 22;
constexpr double chevronWidth = 12;
constexpr double chevronHeight = 20;
constexpr double smallGap = 8;
/// The dots stand this far inside the margin's edge; their target reaches into the margin.
constexpr double moreOverhang = 10;

Rect centred(double x, double width, double height, double rowHeight) {
    return {x, std::round((rowHeight - height) / 2), width, height};
}

} // namespace

RowGeometry::RowGeometry(const RowParts& parts, const RowStyle& style) {
    const double shift = parts.editing * (circleEdge + Theme::iconGap);
    circle = centred(style.margin + shift - circleEdge - Theme::iconGap, circleEdge, circleEdge,
                     parts.height);
    icon = centred(style.margin + shift, parts.iconEdge, parts.iconEdge, parts.height);

    double end = parts.width - style.margin;
    if (parts.chevron) {
        chevron = centred(end - chevronWidth, chevronWidth, chevronHeight, parts.height);
        end = chevron.x - smallGap;
    }
    if (parts.more) {
        const double overhang = parts.chevron ? 0 : moreOverhang;
        more = centred(end + overhang - Theme::minimumTarget, Theme::minimumTarget,
                       std::min(parts.height, Theme::minimumTarget), parts.height);
        end = more.x;
    }
    if (parts.badge) {
        badge = centred(end - badgeEdge, badgeEdge, badgeEdge, parts.height);
        end = badge.x - smallGap;
    }

    lineStart = icon.maxX() + Theme::iconGap;
    const double width = std::max(0.0, end - lineStart);
    const double top = std::floor((parts.height - style.nameHeight - style.detailsHeight) / 2);
    name = {lineStart, top, width, style.nameHeight};
    details = {lineStart, top + style.nameHeight, width, style.detailsHeight};
}

} // namespace platform
