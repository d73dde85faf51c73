#include "platform/ui/qt/TransformEffect.h"

#include <QPainter>

namespace platform {

void TransformEffect::set(double opacity, double scale) {
    opacity_ = opacity;
    scale_ = scale;
    update();
}

void TransformEffect::draw(QPainter* painter) {
    QPoint offset;
    const QPixmap picture = sourcePixmap(Qt::LogicalCoordinates, &offset, NoPad);
    const QPointF center = sourceBoundingRect(Qt::LogicalCoordinates).center();
    painter->save();
    painter->setRenderHint(QPainter::SmoothPixmapTransform);
    painter->setOpacity(painter->opacity() * opacity_);
    painter->translate(center);
    painter->scale(scale_, scale_);
    painter->translate(-center);
    painter->drawPixmap(offset, picture);
    painter->restore();
}

} // namespace platform
