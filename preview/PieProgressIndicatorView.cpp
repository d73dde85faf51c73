#include "preview/PieProgressIndicatorView.h"

#include "platform/ui/Canvas.h"

#include <algorithm>
#include <cmath>
#include <numbers>

namespace tavrin {
namespace {

// An empty or a full wedge would not be drawn as one.
constexpr double smallestShown = 0.005;
constexpr double largestShown = 0.995;
constexpr platform::Color lightGray = platform::Color::gray(2.0 / 3);
constexpr double outlineWidth = 1;

} // namespace

PieProgressIndicatorView::PieProgressIndicatorView(platform::Rect frame) : View(frame) {
    setBackgroundColor(platform::Color::clear);
}

void PieProgressIndicatorView::setProgress(float progress) {
    if (progress == progress_)
        return;
    progress_ = progress;
    setNeedsDisplay();
}

void PieProgressIndicatorView::draw(platform::Canvas& canvas) {
    const platform::Rect area = bounds();
    const double shown = std::clamp<double>(progress_, smallestShown, largestShown);
    constexpr double top = -std::numbers::pi / 2;
    platform::Path wedge;
    wedge.moveTo(area.center());
    wedge.addArc(area.center(), std::ceil(area.height / 2), top, shown * 2 * std::numbers::pi + top,
                 true);
    wedge.lineTo(area.center());
    canvas.fill(wedge, lightGray);
    canvas.strokeEllipse(area, lightGray, outlineWidth);
}

} // namespace tavrin
