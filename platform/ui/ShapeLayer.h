#pragma once

#include "platform/ui/Canvas.h"

#include <functional>
#include <memory>
#include <optional>
#include <vector>

namespace platform {

/// A drawn shape of a view: a path with a fill and a stroke. Belongs to the main thread; a change
/// repaints the view that carries it.
class ShapeLayer {
public:
    const Path& path() const { return path_; }
    void setPath(const Path& path);
    std::optional<Color> fillColor() const { return fill_; }
    void setFillColor(std::optional<Color> color);
    std::optional<Color> strokeColor() const { return stroke_; }
    void setStrokeColor(std::optional<Color> color);
    double lineWidth() const { return lineWidth_; }
    void setLineWidth(double width);
    /// Called when something changed; set by the view that carries the layer.
    void setChangeHandler(std::function<void()> handler) { changed_ = std::move(handler); }

private:
    void changed();

    Path path_;
    std::optional<Color> fill_;
    std::optional<Color> stroke_;
    double lineWidth_ = 1;
    std::function<void()> changed_;
};

struct LayerShadow {
    Color color;
    Point offset;
    double opacity = 0;
    double radius = 0;
};

} // namespace platform
