#pragma once

#include "platform/ui/Color.h"
#include "platform/ui/Font.h"
#include "platform/ui/Geometry.h"
#include "platform/ui/Image.h"
#include "platform/ui/View.h"

#include <QColor>
#include <QFont>
#include <QImage>
#include <QRectF>
#include <QString>

#include <functional>
#include <memory>
#include <string>
#include <string_view>

class QPainter;
class QWidget;

// The toolkit's Qt side, for .cpp files of platform/ui, platform/documents and platform/launch
// only.
namespace platform {

/// The widget that a view owns; none after Qt has destroyed it (the end of the program).
QWidget* widgetOf(const View& view);
/// The view that owns this widget or the nearest one above it; none outside any view.
View* viewOf(const QWidget* widget);

/// A view whose widget is one of Qt's or our own: a virtualised list, a page renderer. The widget
/// paints and handles its events itself; the view places it.
class WidgetView : public View {
public:
    explicit WidgetView(std::unique_ptr<QWidget> widget);

    /// What layout asks for; call invalidateIntrinsicContentSize() when the answer changes.
    void setIntrinsicSize(std::function<Size()> size);
    void setHeightForWidth(std::function<double(double width)> height);

    Size intrinsicContentSize() const override;
    double intrinsicHeightForWidth(double width) const override;

private:
    std::function<Size()> size_;
    std::function<double(double)> heightForWidth_;
};

/// The font at the user's text scale, with the theme's fallback families.
QFont toQt(const Font& font);
QColor toQt(const Color& color);
QRectF toQt(const Rect& rect);
QString toQt(std::string_view text);
Rect fromQt(const QRectF& rect);
std::string fromQt(const QString& text);

/// A picture of pixels; `scale` pixels a point. May be called on any thread.
Image imageOf(QImage pixels, double scale = 1);
/// Pixels of the picture at a size in points; for painting by hand prefer paintImage.
QImage toQt(const Image& image, Size points, double scale);
/// Fills `target`; drawn at the device's own resolution, mirrored where the picture points along
/// the reading direction.
void paintImage(QPainter& painter, const Image& image, const QRectF& target);

/// One line of text in `target`, its line box centred vertically, elided in the middle (or at its
/// tail) where it does not fit, at the leading edge of the program's direction.
void paintLine(QPainter& painter, const QString& text, const Font& font, const Color& color,
               const QRectF& target, Qt::TextElideMode elide = Qt::ElideMiddle);

} // namespace platform
