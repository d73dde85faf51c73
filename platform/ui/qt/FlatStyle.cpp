#include "platform/ui/qt/FlatStyle.h"

#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"

#include <QPainter>
#include <QStyleOption>

#include <algorithm>

namespace platform {
namespace {

constexpr int scrollBarExtent = 12;
constexpr double scrollHandleThickness = 6;
constexpr int shortestHandle = 36;

void paintScrollHandle(QPainter& painter, QRectF part, const QStyleOptionSlider& option) {
    const bool horizontal = option.orientation == Qt::Horizontal;
    const double spare = ((horizontal ? part.height() : part.width()) - scrollHandleThickness) / 2;
    part = horizontal ? part.adjusted(2, spare, -2, -spare) : part.adjusted(spare, 2, -spare, -2);
    const bool pressed = (option.state & QStyle::State_Sunken) != 0;
    const bool hovered = (option.state & QStyle::State_MouseOver) != 0;
    const double strength = pressed ? 0.55 : hovered ? 0.42 : 0.28;
    painter.save();
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(Qt::NoPen);
    painter.setBrush(toQt(Theme::text.withAlpha(strength)));
    painter.drawRoundedRect(part, scrollHandleThickness / 2, scrollHandleThickness / 2);
    painter.restore();
}

} // namespace

FlatStyle::FlatStyle() : QProxyStyle(QStringLiteral("Fusion")) {
}

void FlatStyle::drawPrimitive(PrimitiveElement element, const QStyleOption* option,
                              QPainter* painter, const QWidget* widget) const {
    switch (element) {
    case PE_PanelLineEdit:
    case PE_FrameLineEdit:
    case PE_FrameFocusRect:
        // Text fields and focus rings paint their own.
        return;
    case PE_PanelTipLabel:
        painter->fillRect(option->rect, toQt(Theme::text));
        return;
    default:
        QProxyStyle::drawPrimitive(element, option, painter, widget);
    }
}

void FlatStyle::drawComplexControl(ComplexControl control, const QStyleOptionComplex* option,
                                   QPainter* painter, const QWidget* widget) const {
    const auto* const slider = qstyleoption_cast<const QStyleOptionSlider*>(option);
    if (control != CC_ScrollBar || !slider) {
        QProxyStyle::drawComplexControl(control, option, painter, widget);
        return;
    }
    if (slider->minimum < slider->maximum)
        paintScrollHandle(*painter, subControlRect(control, option, SC_ScrollBarSlider, widget),
                          *slider);
}

int FlatStyle::pixelMetric(PixelMetric metric, const QStyleOption* option,
                           const QWidget* widget) const {
    switch (metric) {
    case PM_ScrollBarExtent:
        return scrollBarExtent;
    case PM_ScrollBarSliderMin:
        return shortestHandle;
    case PM_DefaultFrameWidth:
        return 1;
    default:
        return QProxyStyle::pixelMetric(metric, option, widget);
    }
}

int FlatStyle::styleHint(StyleHint hint, const QStyleOption* option, const QWidget* widget,
                         QStyleHintReturn* data) const {
    switch (hint) {
    case SH_ScrollBar_Transient:
    case SH_UnderlineShortcut:
    case SH_EtchDisabledText:
    case SH_Widget_Animate:
    case SH_DialogButtonBox_ButtonsHaveIcons:
        return 0;
    case SH_ScrollBar_LeftClickAbsolutePosition:
        return 1;
    default:
        return QProxyStyle::styleHint(hint, option, widget, data);
    }
}

QRect FlatStyle::subControlRect(ComplexControl control, const QStyleOptionComplex* option,
                                SubControl part, const QWidget* widget) const {
    const auto* const slider = qstyleoption_cast<const QStyleOptionSlider*>(option);
    if (control != CC_ScrollBar || !slider)
        return QProxyStyle::subControlRect(control, option, part, widget);
    const bool horizontal = slider->orientation == Qt::Horizontal;
    const QRect all = slider->rect;
    const int length = horizontal ? all.width() : all.height();
    const int range = slider->maximum - slider->minimum;
    int handle = length;
    if (range > 0) {
        const qint64 whole = qint64(range) + slider->pageStep;
        handle = std::clamp(static_cast<int>(qint64(slider->pageStep) * length / whole),
                            std::min(shortestHandle, length), length);
    }
    const int start =
        sliderPositionFromValue(slider->minimum, slider->maximum, slider->sliderPosition,
                                length - handle, slider->upsideDown);
    const auto piece = [&](int from, int extent) {
        return horizontal ? QRect(all.x() + from, all.y(), extent, all.height())
                          : QRect(all.x(), all.y() + from, all.width(), extent);
    };
    switch (part) {
    case SC_ScrollBarSlider:
        return piece(start, handle);
    case SC_ScrollBarSubPage:
        return piece(0, start);
    case SC_ScrollBarAddPage:
        return piece(start + handle, length - start - handle);
    case SC_ScrollBarGroove:
        return all;
    default:
        return {};
    }
}

QPalette themePalette() {
    const QColor text = toQt(Theme::text);
    QPalette palette(text, toQt(Theme::bar), toQt(Theme::page), toQt(Theme::hairline),
                     toQt(Theme::badge), text, text, toQt(Theme::page), toQt(Theme::page));
    palette.setColor(QPalette::Highlight, toQt(Theme::accent));
    palette.setColor(QPalette::HighlightedText, Qt::white);
    palette.setColor(QPalette::PlaceholderText, toQt(Theme::secondaryText));
    palette.setColor(QPalette::ToolTipBase, text);
    palette.setColor(QPalette::ToolTipText, Qt::white);
    palette.setColor(QPalette::Link, toQt(Theme::accent));
    const QColor faded = toQt(Theme::text.withAlpha(Theme::disabledAlpha));
    for (const auto role : {QPalette::Text, QPalette::WindowText, QPalette::ButtonText})
        palette.setColor(QPalette::Disabled, role, faded);
    return palette;
}

} // namespace platform
