#include "platform/ui/qt/Bridge.h"

#include "platform/ui/qt/LiveViews.h"
#include "platform/ui/qt/Settings.h"
#include "platform/ui/qt/TextMetrics.h"
#include "platform/ui/qt/ViewImpl.h"

#include <QFontMetricsF>
#include <QPainter>

#include <cmath>

namespace platform {

QWidget* widgetOf(const View& view) {
    return view.impl().widget;
}

View* viewOf(const QWidget* widget) {
    for (; widget; widget = widget->parentWidget())
        if (void* const view = widget->property("platformView").value<void*>())
            return static_cast<View*>(view);
    return nullptr;
}

WidgetView::WidgetView(std::unique_ptr<QWidget> widget)
    : View(std::make_unique<Impl>(std::move(widget))) {
}

void WidgetView::setIntrinsicSize(std::function<Size()> size) {
    size_ = std::move(size);
    invalidateIntrinsicContentSize();
}

void WidgetView::setHeightForWidth(std::function<double(double)> height) {
    heightForWidth_ = std::move(height);
    invalidateIntrinsicContentSize();
}

Size WidgetView::intrinsicContentSize() const {
    return size_ ? size_() : View::intrinsicContentSize();
}

double WidgetView::intrinsicHeightForWidth(double width) const {
    return heightForWidth_ ? heightForWidth_(width) : noIntrinsicMetric;
}

QColor toQt(const Color& color) {
    return QColor::fromRgbF(static_cast<float>(color.red), static_cast<float>(color.green),
                            static_cast<float>(color.blue), static_cast<float>(color.alpha));
}

QRectF toQt(const Rect& rect) {
    return {rect.x, rect.y, rect.width, rect.height};
}

QString toQt(std::string_view text) {
    return QString::fromUtf8(text.data(), static_cast<qsizetype>(text.size()));
}

Rect fromQt(const QRectF& rect) {
    return {rect.x(), rect.y(), rect.width(), rect.height()};
}

std::string fromQt(const QString& text) {
    return text.toStdString();
}

void paintLine(QPainter& painter, const QString& text, const Font& font, const Color& color,
               const QRectF& target, Qt::TextElideMode elide) {
    const QFont qtFont = toQt(font);
    const QFontMetricsF metrics(qtFont);
    const QString shown = metrics.elidedText(text, elide, target.width());
    const double width = metrics.horizontalAdvance(shown);
    const LineMetrics line = lineMetrics(font);
    const double x = isRightToLeft() ? target.right() - width : target.left();
    const double y = std::round(target.center().y() - line.height / 2 + line.ascent);
    painter.setFont(qtFont);
    painter.setPen(toQt(color));
    painter.drawText(QPointF(x, y), shown);
}

std::unordered_set<View::Impl*>& liveViews() {
    // Never destroyed: a screen of static life may go after every other static object.
    static auto* const views = new std::unordered_set<View::Impl*>;
    return *views;
}

void destroyWidgetsOfLiveViews() {
    for (View::Impl* const each : std::unordered_set<View::Impl*>(liveViews())) {
        // A window takes the widgets in it along.
        if (each->widget && !each->widget->parentWidget())
            delete each->widget.data();
    }
}

} // namespace platform
