#include "platform/ui/Canvas.h"

#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/PainterCanvas.h"

#include <QImage>
#include <QPainter>

#include <algorithm>
#include <cmath>
#include <numbers>

namespace platform {
namespace {

constexpr double fullTurn = 2 * std::numbers::pi;
constexpr double degreesPerRadian = 180 / std::numbers::pi;

/// How far an arc turns: within one turn, in its own direction; a whole one stays whole.
double sweepOf(double start, double end, bool clockwise) {
    const double sweep = clockwise ? end - start : start - end;
    if (sweep >= fullTurn)
        return fullTurn;
    const double rest = std::fmod(sweep, fullTurn);
    return rest < 0 ? rest + fullTurn : rest;
}

} // namespace

Path::Path() : data_(std::make_unique<Data>()) {
}

Path::~Path() = default;

Path::Path(const Path& other) : data_(std::make_unique<Data>(*other.data_)) {
}

Path& Path::operator=(const Path& other) {
    *data_ = *other.data_;
    return *this;
}

void Path::moveTo(Point point) {
    data_->path.moveTo(point.x, point.y);
}

void Path::lineTo(Point point) {
    data_->path.lineTo(point.x, point.y);
}

void Path::addArc(Point center, double radius, double startAngle, double endAngle, bool clockwise) {
    const QRectF circle(center.x - radius, center.y - radius, 2 * radius, 2 * radius);
    // Qt's angles grow against the clock.
    const double start = -startAngle * degreesPerRadian;
    const double sweep = sweepOf(startAngle, endAngle, clockwise) * degreesPerRadian;
    if (data_->path.elementCount() == 0)
        data_->path.arcMoveTo(circle, start);
    data_->path.arcTo(circle, start, clockwise ? -sweep : sweep);
}

void Path::addOval(Rect rect) {
    data_->path.addEllipse(toQt(rect));
}

void Path::addRoundedRect(Rect rect, double radius) {
    data_->path.addRoundedRect(toQt(rect), radius, radius);
}

void Path::close() {
    data_->path.closeSubpath();
}

void Canvas::fillEllipse(Rect rect, Color color) {
    Path oval;
    oval.addOval(rect);
    fill(oval, color);
}

void Canvas::strokeEllipse(Rect rect, Color color, double lineWidth) {
    Path oval;
    oval.addOval(rect);
    stroke(oval, color, lineWidth);
}

void PainterCanvas::fill(const Path& path, Color color) {
    painter_.fillPath(path.data().path, toQt(color));
}

void PainterCanvas::stroke(const Path& path, Color color, double lineWidth) {
    painter_.strokePath(path.data().path, QPen(toQt(color), lineWidth));
}

struct ImageCanvas::State {
    State(Size size, bool opaque, double pixelsPerPoint)
        : scale(pixelsPerPoint),
          pixels(std::max(1, static_cast<int>(std::ceil(size.width * scale))),
                 std::max(1, static_cast<int>(std::ceil(size.height * scale))),
                 QImage::Format_ARGB32_Premultiplied) {
        pixels.fill(opaque ? Qt::black : Qt::transparent);
        painter.begin(&pixels);
        painter.setRenderHint(QPainter::Antialiasing);
        painter.scale(scale, scale);
    }

    double scale;
    QImage pixels;
    // Ends before the pixels that it draws on.
    QPainter painter;
};

ImageCanvas::ImageCanvas(Size size, bool opaque, double scale)
    : state_(std::make_unique<State>(size, opaque, scale)) {
}

ImageCanvas::~ImageCanvas() = default;

void ImageCanvas::fill(const Path& path, Color color) {
    PainterCanvas(state_->painter).fill(path, color);
}

void ImageCanvas::stroke(const Path& path, Color color, double lineWidth) {
    PainterCanvas(state_->painter).stroke(path, color, lineWidth);
}

Image ImageCanvas::image() const {
    return imageOf(state_->pixels.copy(), state_->scale);
}

} // namespace platform
