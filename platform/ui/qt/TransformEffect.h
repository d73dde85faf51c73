#pragma once

#include <QGraphicsEffect>

namespace platform {

/// Shows a widget and what is in it as one picture, scaled about its centre and translucent.
class TransformEffect : public QGraphicsEffect {
public:
    void set(double opacity, double scale);

protected:
    void draw(QPainter* painter) override;

private:
    double opacity_ = 1;
    double scale_ = 1;
};

} // namespace platform
