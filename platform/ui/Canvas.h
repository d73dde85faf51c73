#pragma once

#include "platform/ui/Color.h"
#include "platform/ui/Geometry.h"
#include "platform/ui/Image.h"

#include <memory>

namespace platform {

/// A closed or open outline. Angles in radians, 0 to the right, growing clockwise on screen.
class Path {
public:
    Path();
    ~Path();
    Path(const Path& other);
    Path& operator=(const Path& other);

    void moveTo(Point point);
    void lineTo(Point point);
    /// A straight line to the arc's start (when there is a current point), then the arc.
    void addArc(Point center, double radius, double startAngle, double endAngle, bool clockwise);
    void addOval(Rect rect);
    void addRoundedRect(Rect rect, double radius);
    void close();

    struct Data;
    const Data& data() const { return *data_; }

private:
    std::unique_ptr<Data> data_;
};

/// Something to draw on: an image in the making, or a view during its draw. Points, y downward.
class Canvas {
public:
    virtual ~Canvas() = default;
    virtual void fill(const Path& path, Color color) = 0;
    virtual void stroke(const Path& path, Color color, double lineWidth) = 0;
    void fillEllipse(Rect rect, Color color);
    void strokeEllipse(Rect rect, Color color, double lineWidth);
};

/// A canvas whose drawing becomes an image. `scale` is in pixels a point.
class ImageCanvas : public Canvas {
public:
    ImageCanvas(Size size, bool opaque, double scale);
    ~ImageCanvas() override;
    void fill(const Path& path, Color color) override;
    void stroke(const Path& path, Color color, double lineWidth) override;
    Image image() const;

private:
    struct State;
    std::unique_ptr<State> state_;
};

} // namespace platform
