#pragma once

#include "platform/ui/Canvas.h"

#include <QPainterPath>

class QPainter;

namespace platform {

struct Path::Data {
    QPainterPath path;
};

/// A canvas on a painter that somebody else began.
class PainterCanvas : public Canvas {
public:
    explicit PainterCanvas(QPainter& painter) : painter_(painter) {}
    void fill(const Path& path, Color color) override;
    void stroke(const Path& path, Color color, double lineWidth) override;

private:
    QPainter& painter_;
};

} // namespace platform
