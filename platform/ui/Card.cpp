#include "platform/ui/Card.h"

#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/ViewImpl.h"

#include <QPainter>
#include <QPainterPath>
#include <QPixmapCache>

#include <algorithm>
#include <cmath>
#include <vector>

namespace platform {
namespace {

/// A shadow is soft: a quarter of the resolution shows it as well.
constexpr int shadowReduction = 4;
constexpr int blurPasses = 3;

/// One pass of a moving average along the lines of the coverage.
void blurLine(std::vector<int>& line, int radius) {
    const int size = static_cast<int>(line.size());
    const std::vector<int> source = line;
    const auto at = [&](int i) {
        return source[static_cast<std::size_t>(std::clamp(i, 0, size - 1))];
    };
    int sum = 0;
    for (int i = -radius; i <= radius; ++i)
        sum += at(i);
    for (int i = 0; i < size; ++i) {
        line[static_cast<std::size_t>(i)] = sum / (2 * radius + 1);
        sum += at(i + radius + 1) - at(i - radius);
    }
}

void blur(QImage& coverage, int radius) {
    std::vector<int> line;
    const auto pass = [&](int lines, int length, const auto& pixel) {
        for (int l = 0; l < lines; ++l) {
            line.resize(static_cast<std::size_t>(length));
            for (int i = 0; i < length; ++i)
                line[static_cast<std::size_t>(i)] = *pixel(l, i);
            for (int i = 0; i < blurPasses; ++i)
                blurLine(line, radius);
            for (int i = 0; i < length; ++i)
                *pixel(l, i) = static_cast<uchar>(line[static_cast<std::size_t>(i)]);
        }
    };
    pass(coverage.height(), coverage.width(),
         [&](int y, int x) { return coverage.scanLine(y) + x; });
    pass(coverage.width(), coverage.height(),
         [&](int x, int y) { return coverage.scanLine(y) + x; });
}

/// The shadow of a rounded rectangle of that size, with `reach` around it.
QPixmap shadowOf(QSizeF ground) {
    const QString key =
        QStringLiteral("platform:shadow:%1:%2").arg(ground.width()).arg(ground.height());
    QPixmap result;
    if (QPixmapCache::find(key, &result))
        return result;
    const double reach = Card::reach;
    QImage coverage(static_cast<int>(ground.width() + 2 * reach) / shadowReduction,
                    static_cast<int>(ground.height() + 2 * reach) / shadowReduction,
                    QImage::Format_Alpha8);
    coverage.fill(0);
    {
        QPainter painter(&coverage);
        painter.setRenderHint(QPainter::Antialiasing);
        painter.scale(1.0 / shadowReduction, 1.0 / shadowReduction);
        painter.setPen(Qt::NoPen);
        painter.setBrush(Qt::black);
        painter.drawRoundedRect(
            QRectF(reach, reach + Theme::shadowOffset, ground.width(), ground.height()),
            Theme::overlayCorner, Theme::overlayCorner);
    }
    // Three passes of this width come near the bell curve of half the radius.
    blur(coverage, static_cast<int>(Theme::shadowRadius / 2 / shadowReduction));
    QImage colored(coverage.size(), QImage::Format_ARGB32_Premultiplied);
    for (int y = 0; y < colored.height(); ++y)
        for (int x = 0; x < colored.width(); ++x)
            colored.setPixel(
                x, y,
                qRgba(0, 0, 0, static_cast<int>(coverage.scanLine(y)[x] * Theme::shadowAlpha)));
    result = QPixmap::fromImage(colored);
    QPixmapCache::insert(key, result);
    return result;
}

QPainterPath arrowPath(const QRectF& ground, ArrowDirection side, double at) {
    const double half = popoverArrowHalfBase;
    const double high = popoverArrowHeight;
    QPolygonF arrow;
    switch (side) {
    case ArrowDirection::up:
        arrow << QPointF(at - half, 1) << QPointF(at, -high) << QPointF(at + half, 1);
        break;
    case ArrowDirection::down:
        arrow << QPointF(at - half, ground.height() - 1) << QPointF(at, ground.height() + high)
              << QPointF(at + half, ground.height() - 1);
        break;
    case ArrowDirection::left:
        arrow << QPointF(1, at - half) << QPointF(-high, at) << QPointF(1, at + half);
        break;
    case ArrowDirection::right:
        arrow << QPointF(ground.width() - 1, at - half) << QPointF(ground.width() + high, at)
              << QPointF(ground.width() - 1, at + half);
        break;
    case ArrowDirection::any:
        return {};
    }
    QPainterPath path;
    path.addPolygon(arrow.translated(ground.topLeft()));
    path.closeSubpath();
    return path;
}

} // namespace

struct Card::Painting : View::Impl {
    explicit Painting(Look whichLook) : look(whichLook) {}

    double shadowMargin() const { return look == Look::groundOnly ? 0 : reach; }

    void paintContent(QPainter& painter, const QRectF& bounds) override {
        const double margin = shadowMargin();
        const QRectF ground = bounds.adjusted(margin, margin, -margin, -margin);
        if (ground.isEmpty())
            return;
        if (look != Look::groundOnly) {
            painter.setRenderHint(QPainter::SmoothPixmapTransform);
            const QPixmap soft = shadowOf(ground.size());
            painter.drawPixmap(bounds, soft, QRectF(soft.rect()));
        }
        if (look == Look::shadowOnly)
            return;
        QPainterPath path;
        path.addRoundedRect(ground, Theme::overlayCorner, Theme::overlayCorner);
        painter.fillPath(path.united(arrowPath(ground, arrow, arrowAt)), toQt(Theme::page));
    }

    Look look;
    ArrowDirection arrow = ArrowDirection::any;
    double arrowAt = 0;
};

Card::Card(Look look) : View(std::make_unique<Painting>(look)) {
}

Card::Painting& Card::painting() const {
    return static_cast<Painting&>(impl());
}

double Card::margin() const {
    return painting().shadowMargin();
}

void Card::setGround(Rect ground) {
    setFrame(ground.inset(-margin(), -margin()));
}

Rect Card::ground() const {
    return bounds().inset(margin(), margin());
}

void Card::setArrow(ArrowDirection side, double at) {
    painting().arrow = side;
    painting().arrowAt = at;
    setNeedsDisplay();
}

} // namespace platform
