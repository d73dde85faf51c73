#include "platform/documents/list/RowPainter.h"

#include "platform/ui/Direction.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/ViewWidget.h"

#include <QPainter>
#include <QPainterPath>

#include <algorithm>
#include <array>
#include <cmath>

namespace platform {
namespace {

constexpr Color hoverFill = Color::hex(0xF3F5F8);
constexpr Color pressedFill = Color::hex(0xE9ECF1);
constexpr Color placeholderFill = Color::hex(0xECEEF2);
constexpr double frameCorner = 8;
constexpr double containerCorner = 11;
/// Quieter than the rows that can be opened, and still to be read.
constexpr double dimmedAlpha = 0.45;
/// What is not on this device.
constexpr double promisedAlpha = 0.55;
constexpr double thumbnailCorner = 3;
/// However thin a picture is, it can be seen.
constexpr double leastThumbnail = 4;
/// Beside drawn-in actions a narrower second line would say nothing.
constexpr double leastDetailsWidth = 96;

/// Paints the parts of one row, mirroring what it takes from the geometry.
class Painting {
public:
    Painting(QPainter& painter, const QRectF& area, RowContent& content, const RowLook& look,
             const RowStyle& style)
        : painter_(painter),
          area_(area),
          content_(content),
          look_(look),
          style_(style),
          geometry_(partsOf(content, look, area.width(), area.height()), style) {}

    void paint() {
        paintBackground();
        if (look_.editing > 0)
            paintCircle();
        painter_.setOpacity(look_.dimmed ? dimmedAlpha : 1);
        paintIcon();
        paintTexts();
        paintBadge();
        painter_.setOpacity(1);
        if (geometry_.chevron.width > 0)
            paintEnd(SystemImage::chevron, geometry_.chevron, 16, 1 - look_.editing);
        if (geometry_.more.width > 0)
            paintEnd(SystemImage::more, geometry_.more, 24, 1 - look_.editing);
        if (look_.focused)
            paintFocusRing(painter_, area_.adjusted(2, 1, -2, -2), frameCorner);
    }

private:
    QRectF place(const Rect& part) const {
        return toQt(mirrored(part, area_.width())).translated(area_.topLeft());
    }

    void paintBackground() {
        if (look_.selected || look_.pressed || look_.hovered) {
            const Color& fill = look_.selected  ? Theme::selection
                                : look_.pressed ? pressedFill
                                                : hoverFill;
            painter_.fillRect(area_, toQt(fill));
        }
        if (look_.lastRow)
            return;
        const double start = geometry_.lineStart;
        const Rect line{start, area_.height() - 1, area_.width() - start, 1};
        painter_.fillRect(place(line), toQt(Theme::hairline));
    }

    void paintCircle() {
        const QRectF circle = place(geometry_.circle).adjusted(1, 1, -1, -1);
        painter_.save();
        painter_.setOpacity(look_.editing);
        if (look_.selected) {
            painter_.setPen(Qt::NoPen);
            painter_.setBrush(toQt(Theme::accent));
            painter_.drawEllipse(circle.adjusted(-0.5, -0.5, 0.5, 0.5));
            paintImage(painter_, Image::system(SystemImage::checkmark).tinted(Color::white),
                       circle.adjusted(3, 3, -3, -3));
        } else {
            painter_.setPen(QPen(toQt(Theme::badge), 1.5));
            painter_.setBrush(Qt::NoBrush);
            painter_.drawEllipse(circle);
        }
        painter_.restore();
    }

    void paintIcon() {
        const QRectF frame = place(geometry_.icon);
        if (!look_.thumbnail.empty()) {
            paintThumbnail(frame);
            return;
        }
        if (isDocument(content_.kind)) {
            painter_.setPen(QPen(toQt(Theme::hairline), 1));
            painter_.setBrush(toQt(Theme::page));
            painter_.drawRoundedRect(frame.adjusted(0.5, 0.5, -0.5, -0.5), frameCorner,
                                     frameCorner);
        }
        const Size size = content_.icon.size();
        QRectF target(0, 0, size.width, size.height);
        target.moveCenter(frame.center());
        painter_.save();
        if (content_.promised)
            painter_.setOpacity(painter_.opacity() * promisedAlpha);
        paintImage(painter_, content_.icon, target);
        painter_.restore();
        if (content_.kind == EntryKind::container) {
            painter_.setPen(QPen(toQt(Theme::text.withAlpha(0.12)), 1));
            painter_.setBrush(Qt::NoBrush);
            painter_.drawRoundedRect(target.adjusted(0.5, 0.5, -0.5, -0.5), containerCorner,
                                     containerCorner);
        }
    }

    /// Whole, however long or high it is, within a line that ends white paper on a white page.
    void paintThumbnail(const QRectF& frame) {
        const Size size = look_.thumbnail.size();
        const double factor =
            std::min({1.0, frame.width() / size.width, frame.height() / size.height});
        QRectF target(0, 0, std::max(leastThumbnail, std::round(size.width * factor)),
                      std::max(leastThumbnail, std::round(size.height * factor)));
        target.moveTopLeft({std::round(frame.center().x() - target.width() / 2),
                            std::round(frame.center().y() - target.height() / 2)});
        painter_.save();
        if (content_.promised)
            painter_.setOpacity(painter_.opacity() * promisedAlpha);
        QPainterPath shape;
        shape.addRoundedRect(target, thumbnailCorner, thumbnailCorner);
        painter_.save();
        painter_.setClipPath(shape, Qt::IntersectClip);
        painter_.fillRect(target, toQt(Theme::page));
        paintImage(painter_, look_.thumbnail, target);
        painter_.restore();
        painter_.setPen(QPen(toQt(Theme::text.withAlpha(0.16)), 1));
        painter_.setBrush(Qt::NoBrush);
        painter_.drawRoundedRect(target.adjusted(0.5, 0.5, -0.5, -0.5), thumbnailCorner,
                                 thumbnailCorner);
        painter_.restore();
    }

    void paintTexts() {
        const double width = geometry_.name.width;
        if (content_.fittingFor != width) {
            content_.fittingName = elidedName(content_.name, QFontMetricsF(style_.name), width);
            content_.fittingDetails =
                fittingForm(content_.details, QFontMetricsF(style_.details), width);
            content_.fittingFor = width;
        }
        const bool alone = content_.details.empty() || (look_.aside && width < leastDetailsWidth);
        Rect name = geometry_.name;
        if (alone && (look_.aside || content_.kind == EntryKind::container))
            name.y += style_.detailsHeight / 2;
        paintText(content_.fittingName, name, style_.name, style_.nameAscent, Theme::text);
        if (!alone)
            paintText(content_.fittingDetails, geometry_.details, style_.details,
                      style_.detailsAscent, Theme::secondaryText);
    }

    void paintText(const QString& text, const Rect& part, const QFont& font, double ascent,
                   const Color& color) {
        const QRectF line = place(part);
        painter_.setFont(font);
        painter_.setPen(toQt(color));
        const double x = style_.rightToLeft
                             ? line.right() - QFontMetricsF(font).horizontalAdvance(text)
                             : line.left();
        painter_.drawText(QPointF(x, line.top() + ascent), text);
    }

    void paintBadge() {
        if (geometry_.badge.width <= 0)
            return;
        if (look_.progress)
            paintRing(place(geometry_.badge).adjusted(2, 2, -2, -2), *look_.progress);
        else if (content_.promised)
            paintImage(painter_, Image::system(SystemImage::cloudDownload).tinted(Theme::badge),
                       place(geometry_.badge));
    }

    void paintRing(const QRectF& ring, double progress) {
        constexpr int top = 90 * 16;
        painter_.setBrush(Qt::NoBrush);
        painter_.setPen(QPen(toQt(Theme::hairline), 2.5));
        painter_.drawEllipse(ring);
        painter_.setPen(QPen(toQt(Theme::accent), 2.5, Qt::SolidLine, Qt::RoundCap));
        painter_.drawArc(ring, top, -static_cast<int>(std::clamp(progress, 0.02, 1.0) * 360 * 16));
    }

    void paintEnd(SystemImage which, const Rect& part, double edge, double opacity) {
        if (opacity <= 0)
            return;
        QRectF target(0, 0, edge, edge);
        target.moveCenter(place(part).center());
        painter_.save();
        painter_.setOpacity(opacity);
        paintImage(painter_, Image::system(which).tinted(Theme::badge), target);
        painter_.restore();
    }

    QPainter& painter_;
    const QRectF area_;
    RowContent& content_;
    const RowLook& look_;
    const RowStyle& style_;
    const RowGeometry geometry_;
};

} // namespace

RowParts partsOf(const RowContent& content, const RowLook& look, double width, double height) {
    RowParts parts;
    parts.width = width;
    parts.height = height;
    parts.iconEdge = rowIconEdge(content.kind);
    parts.badge = (content.promised || look.progress) && !look.aside;
    // The end of the row stays where it is while edit mode comes and goes.
    parts.chevron = !isDocument(content.kind) && look.editing < 1 && !look.aside && !look.dimmed;
    parts.more = look.more && look.editing < 1 && !look.aside;
    parts.editing = look.editing;
    return parts;
}

void paintRow(QPainter& painter, const QRectF& area, RowContent& content, const RowLook& look,
              const RowStyle& style) {
    Painting(painter, area, content, look, style).paint();
}

void paintPlaceholderRow(QPainter& painter, const QRectF& area, const RowStyle& style,
                         std::size_t index) {
    RowParts parts;
    parts.width = area.width();
    parts.height = area.height();
    parts.iconEdge = Theme::rowIcon;
    const RowGeometry geometry(parts, style);
    // Names have different lengths; so have the bars that stand for them.
    constexpr std::array lengths{0.62, 0.48, 0.74, 0.55, 0.4, 0.68};
    const auto bar = [&](const Rect& line, double share, double height, double corner) {
        const Rect shape{line.x, line.midY() - height / 2, line.width * share, height};
        painter.drawRoundedRect(toQt(mirrored(shape, area.width())).translated(area.topLeft()),
                                corner, corner);
    };
    painter.setPen(Qt::NoPen);
    painter.setBrush(toQt(placeholderFill));
    bar(geometry.icon, 1, geometry.icon.height, frameCorner);
    bar(geometry.name, lengths[index % lengths.size()], style.nameHeight * 0.5, 4);
    bar(geometry.details, lengths[index % lengths.size()] * 0.5, style.detailsHeight * 0.5, 4);
}

} // namespace platform
