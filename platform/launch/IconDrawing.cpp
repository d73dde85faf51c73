#include "platform/launch/IconDrawing.h"

#include "platform/ui/Font.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"

#include <QFont>
#include <QFontMetricsF>
#include <QPainter>
#include <QPainterPath>

#include <array>

namespace platform {
namespace {

// Dark enough that white letters on them keep a contrast of 4.5:1.
constexpr std::array tileColors{0x1E6AD6U, 0x7A4FC9U, 0xB0418FU, 0xC62A3AU, 0xB04A12U,
                                0x8A6100U, 0x3E7B27U, 0x0B7A75U, 0x0E7490U, 0x5B6472U};

/// Drawings are made on a square of this edge.
constexpr double designEdge = 40;
constexpr int longestShownExtension = 5;

/// The same on every machine and in every run (FNV-1a).
std::uint32_t hashOf(std::string_view text) {
    std::uint32_t hash = 2166136261U;
    for (const char each : text)
        hash = (hash ^ static_cast<unsigned char>(each)) * 16777619U;
    return hash;
}

Color tileColor(std::string_view text) {
    return Color::hex(tileColors[hashOf(text) % tileColors.size()]);
}

class Drawing {
public:
    explicit Drawing(int pixels) : image_(pixels, pixels, QImage::Format_ARGB32_Premultiplied) {
        image_.fill(Qt::transparent);
        painter_.begin(&image_);
        painter_.setRenderHint(QPainter::Antialiasing);
        painter_.scale(pixels / designEdge, pixels / designEdge);
    }
    QPainter& painter() { return painter_; }
    QImage finish() {
        painter_.end();
        return image_;
    }

    /// Letters centred in the rectangle, no wider than it.
    void letters(const QString& text, const QRectF& target, double size) {
        QFont font = toQt(Font::preferred(TextStyle::headline));
        font.setPixelSize(100);
        const double natural = QFontMetricsF(font).horizontalAdvance(text);
        const double fitting = natural > 0 ? target.width() / natural * 100 : size;
        font.setPixelSize(static_cast<int>(std::min(size, fitting) * 10));
        painter_.save();
        painter_.translate(target.center());
        painter_.scale(0.1, 0.1);
        painter_.setFont(font);
        painter_.setPen(Qt::white);
        const QFontMetricsF metrics(font);
        painter_.drawText(QPointF(-metrics.horizontalAdvance(text) / 2, metrics.capHeight() / 2),
                          text);
        painter_.restore();
    }

private:
    QImage image_;
    QPainter painter_;
};

} // namespace

QImage drawPage(const QString& extension, int pixels) {
    Drawing drawing(pixels);
    QPainter& painter = drawing.painter();
    constexpr double left = 6;
    constexpr double right = 34;
    constexpr double fold = 9;
    QPainterPath page;
    page.moveTo(left + 2, 1);
    page.lineTo(right - fold, 1);
    page.lineTo(right, 1 + fold);
    page.lineTo(right, 37);
    page.quadTo(right, 39, right - 2, 39);
    page.lineTo(left + 2, 39);
    page.quadTo(left, 39, left, 37);
    page.lineTo(left, 3);
    page.quadTo(left, 1, left + 2, 1);
    painter.setPen(QPen(toQt(Theme::badge), 1));
    painter.setBrush(toQt(Theme::bar));
    painter.drawPath(page);
    QPainterPath corner;
    corner.moveTo(right - fold, 1);
    corner.lineTo(right - fold, 1 + fold);
    corner.lineTo(right, 1 + fold);
    corner.closeSubpath();
    painter.setBrush(toQt(Theme::hairline));
    painter.drawPath(corner);
    if (extension.isEmpty())
        return drawing.finish();
    const QRectF band(left - 4, 20, right - left + 8, 12);
    painter.setPen(Qt::NoPen);
    painter.setBrush(toQt(tileColor(extension.toLower().toStdString())));
    painter.drawRoundedRect(band, 2.5, 2.5);
    drawing.letters(extension.left(longestShownExtension).toUpper(), band.adjusted(2, 0, -2, 0), 9);
    return drawing.finish();
}

QImage drawFolder(int pixels) {
    Drawing drawing(pixels);
    QPainter& painter = drawing.painter();
    painter.setPen(Qt::NoPen);
    painter.setBrush(toQt(Theme::accentPressed));
    painter.drawRoundedRect(QRectF(3, 7, 16, 12), 2.5, 2.5);
    painter.drawRoundedRect(QRectF(3, 11, 34, 12), 2.5, 2.5);
    painter.setBrush(toQt(Theme::accent));
    painter.drawRoundedRect(QRectF(3, 14, 34, 20), 2.5, 2.5);
    return drawing.finish();
}

QImage drawLetterTile(std::string_view identifier, const QString& letter, int pixels) {
    Drawing drawing(pixels);
    QPainter& painter = drawing.painter();
    painter.setPen(Qt::NoPen);
    painter.setBrush(toQt(tileColor(identifier)));
    painter.drawRoundedRect(QRectF(0, 0, designEdge, designEdge), 9, 9);
    drawing.letters(letter, QRectF(6, 6, designEdge - 12, designEdge - 12), 20);
    return drawing.finish();
}

} // namespace platform
