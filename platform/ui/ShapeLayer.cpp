#include "platform/ui/ShapeLayer.h"

namespace platform {

void ShapeLayer::setPath(const Path& path) {
    path_ = path;
    changed();
}

void ShapeLayer::setFillColor(std::optional<Color> color) {
    fill_ = color;
    changed();
}

void ShapeLayer::setStrokeColor(std::optional<Color> color) {
    stroke_ = color;
    changed();
}

void ShapeLayer::setLineWidth(double width) {
    lineWidth_ = width;
    changed();
}

void ShapeLayer::changed() {
    if (changed_)
        changed_();
}

} // namespace platform
