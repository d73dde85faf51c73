#include "platform/documents/preview/ZoomPlace.h"

#include <algorithm>
#include <cmath>

namespace platform {

QRectF ZoomPlace::visibleRect() const {
    const QRectF seen(toContent({0, 0}), view_ / zoom_);
    return seen.intersected(QRectF(QPointF(), content_));
}

double ZoomPlace::fittingZoom() const {
    const double room = std::max(1.0, view_.width() - 2 * limits_.margin);
    if (content_.isEmpty() || limits_.fit == Fit::none)
        return 1;
    if (limits_.fit == Fit::width)
        return room / content_.width();
    const double high = std::max(1.0, view_.height() - 2 * limits_.margin);
    return std::min({1.0, room / content_.width(), high / content_.height()});
}

double ZoomPlace::clampedZoom(double zoom) const {
    const double fitting = fittingZoom();
    return std::clamp(zoom, std::min(fitting, limits_.smallestZoom),
                      std::max(limits_.largestZoom, fitting));
}

void ZoomPlace::setSizes(QSizeF view, QSizeF content) {
    const double before = view_.width() - content_.width() * zoom_;
    view_ = view;
    content_ = content;
    if (fitted_)
        zoom_ = fittingZoom();
    if (limits_.fromRight)
        origin_.rx() += view_.width() - content_.width() * zoom_ - before;
    settle();
}

void ZoomPlace::zoomTo(double zoom, QPointF point) {
    bring(toContent(point), zoom, point);
    fitted_ = std::abs(zoom_ - fittingZoom()) < 1e-9;
}

void ZoomPlace::bring(QPointF content, double zoom, QPointF point) {
    fitted_ = false;
    zoom_ = clampedZoom(zoom);
    origin_ = point - content * zoom_;
    settle();
}

bool ZoomPlace::moveBy(QPointF distance) {
    const QPointF wanted = origin_ + distance;
    origin_ = wanted;
    settle();
    return (origin_ - wanted).manhattanLength() < std::max(1.0, distance.manhattanLength());
}

/// What is smaller than the view stands in its middle; what is larger leaves no gap at an edge.
void ZoomPlace::settle() {
    const QSizeF size = content_ * zoom_;
    enum class At { start, middle, end };
    const auto along = [&](double origin, double length, double room, At small) {
        const double free = room - length;
        if (free >= 2 * limits_.margin)
            return small == At::middle  ? free / 2
                   : small == At::start ? limits_.margin
                                        : free - limits_.margin;
        return std::clamp(origin, free - limits_.margin, limits_.margin);
    };
    const At side = limits_.fit != Fit::none ? At::middle : limits_.fromRight ? At::end : At::start;
    origin_ = {along(origin_.x(), size.width(), view_.width(), side),
               along(origin_.y(), size.height(), view_.height(),
                     limits_.fit == Fit::whole ? At::middle : At::start)};
}

ZoomPlace::Extent ZoomPlace::extent(Qt::Orientation direction) const {
    const bool across = direction == Qt::Horizontal;
    const double length = (across ? content_.width() : content_.height()) * zoom_;
    return {limits_.margin - (across ? origin_.x() : origin_.y()),
            across ? view_.width() : view_.height(), length + 2 * limits_.margin};
}

void ZoomPlace::scrollTo(Qt::Orientation direction, double offset) {
    (direction == Qt::Horizontal ? origin_.rx() : origin_.ry()) = limits_.margin - offset;
    settle();
}

} // namespace platform
