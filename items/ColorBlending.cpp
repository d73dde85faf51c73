#include "items/ColorBlending.h"

#include <algorithm>
#include <cmath>
#include <limits>

namespace tavrin {
namespace {

using platform::Color;

bool isNothing(double alpha) {
    return std::abs(alpha) < std::numeric_limits<float>::epsilon();
}

Color sourceOver(const Color& under, const Color& top) {
    const double alpha = top.alpha + under.alpha * (1 - top.alpha);
    if (isNothing(alpha))
        return Color::white.withAlpha(alpha);
    const auto channel = [&](double below, double above) {
        return (top.alpha * above + (1 - top.alpha) * under.alpha * below) / alpha;
    };
    return {channel(under.red, top.red), channel(under.green, top.green),
            channel(under.blue, top.blue), alpha};
}

double blended(CompositingFilter filter, double below, double above) {
    switch (filter) {
    case CompositingFilter::multiply:
        return above * below;
    case CompositingFilter::screen:
        return 1 - (1 - above) * (1 - below);
    case CompositingFilter::overlay:
        return below < 0.5 ? 2 * above * below : 1 - 2 * (1 - above) * (1 - below);
    case CompositingFilter::darken:
        return std::min(above, below);
    case CompositingFilter::lighten:
        return std::max(above, below);
    default:
        return below;
    }
}

} // namespace

Color _colorBlendedWithColor(const Color& under, const std::optional<Color>& top) {
    return _colorBlendedWithColor(under, top, CompositingFilter::sourceOver);
}

Color _colorBlendedWithColor(const Color& under, const std::optional<Color>& top,
                             std::optional<CompositingFilter> filter) {
    if (!top || isNothing(top->alpha))
        return under;
    if (!filter || *filter == CompositingFilter::normal || *filter == CompositingFilter::sourceOver)
        return sourceOver(under, *top);
    if (*filter >= CompositingFilter::colorDodge)
        return under;
    const auto channel = [&](double below, double above) {
        return (1 - top->alpha) * below + top->alpha * blended(*filter, below, above);
    };
    return {channel(under.red, top->red), channel(under.green, top->green),
            channel(under.blue, top->blue), under.alpha};
}

} // namespace tavrin
