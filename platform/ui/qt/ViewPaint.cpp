#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/PainterCanvas.h"
#include "platform/ui/qt/TransformEffect.h"
#include "platform/ui/qt/ViewImpl.h"

#include <QPainter>

#include <cmath>
#include <numbers>

namespace platform {

void View::Impl::paintContent(QPainter& /*painter*/, const QRectF& /*bounds*/) {
}

void View::Impl::paint(QPainter& painter) {
    const QRectF bounds(contentOffset.x, contentOffset.y, frame.width, frame.height);
    painter.setRenderHint(QPainter::Antialiasing);
    paintBackground(painter, bounds);
    paintContent(painter, bounds);
    painter.save();
    painter.translate(bounds.topLeft());
    paintLayers(painter);
    PainterCanvas canvas(painter);
    self->draw(canvas);
    painter.restore();
}

void View::Impl::paintBackground(QPainter& painter, const QRectF& bounds) const {
    if (!background || background->alpha <= 0)
        return;
    if (cornerRadius <= 0) {
        painter.fillRect(bounds, toQt(*background));
        return;
    }
    painter.setPen(Qt::NoPen);
    painter.setBrush(toQt(*background));
    painter.drawRoundedRect(bounds, cornerRadius, cornerRadius);
}

void View::Impl::paintLayers(QPainter& painter) const {
    PainterCanvas canvas(painter);
    const auto drawAll = [&](const auto& colorOf) {
        for (const auto& layer : layers) {
            if (layer->fillColor())
                canvas.fill(layer->path(), colorOf(*layer->fillColor()));
            if (layer->strokeColor())
                canvas.stroke(layer->path(), colorOf(*layer->strokeColor()), layer->lineWidth());
        }
    };
    if (shadow.opacity > 0) {
        // A blur of a fraction of a point: the shapes, faint, at eight places around their own.
        constexpr int places = 8;
        const Color faint =
            shadow.color.withAlpha(shadow.color.alpha * shadow.opacity / (places / 2.0));
        for (int i = 0; i < places; ++i) {
            const double angle = 2 * std::numbers::pi * i / places;
            painter.save();
            painter.translate(shadow.offset.x + shadow.radius * std::cos(angle),
                              shadow.offset.y + shadow.radius * std::sin(angle));
            drawAll([&](const Color&) { return faint; });
            painter.restore();
        }
    }
    drawAll([](const Color& own) { return own; });
}

void View::Impl::applyEffect() {
    if (!widget)
        return;
    if (alpha >= 1 && scale == 1) {
        widget->setGraphicsEffect(nullptr);
        return;
    }
    auto* effect = static_cast<TransformEffect*>(widget->graphicsEffect());
    if (!effect) {
        effect = new TransformEffect;
        widget->setGraphicsEffect(effect);
    }
    effect->set(alpha, scale);
}

} // namespace platform
