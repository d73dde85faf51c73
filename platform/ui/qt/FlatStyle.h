#pragma once

#include <QPalette>
#include <QProxyStyle>

namespace platform {

/// Our own look for what Qt still paints itself: text selections, scroll bars, context menus, tips.
/// Over Fusion, so that no desktop's style shows through.
class FlatStyle : public QProxyStyle {
public:
    FlatStyle();

    void drawPrimitive(PrimitiveElement element, const QStyleOption* option, QPainter* painter,
                       const QWidget* widget) const override;
    void drawComplexControl(ComplexControl control, const QStyleOptionComplex* option,
                            QPainter* painter, const QWidget* widget) const override;
    int pixelMetric(PixelMetric metric, const QStyleOption* option,
                    const QWidget* widget) const override;
    int styleHint(StyleHint hint, const QStyleOption* option, const QWidget* widget,
                  QStyleHintReturn* data) const override;
    QRect subControlRect(ComplexControl control, const QStyleOptionComplex* option, SubControl part,
                         const QWidget* widget) const override;
};

QPalette themePalette();

} // namespace platform
