#include "platform/documents/preview/MediaControls.h"

#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/ViewWidget.h"

#include <QEvent>
#include <QKeyEvent>
#include <QPainter>
#include <QPainterPath>

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

constexpr double glyphEdge = 24;
constexpr double knob = 8;
constexpr double lineHeight = 4;

QPainterPath playShape(double edge) {
    QPainterPath path;
    path.moveTo(-edge * 0.26, -edge * 0.38);
    path.lineTo(edge * 0.4, 0);
    path.lineTo(-edge * 0.26, edge * 0.38);
    path.closeSubpath();
    return path;
}

QPainterPath pauseShape(double edge) {
    QPainterPath path;
    for (const double side : {-1.0, 1.0})
        path.addRoundedRect(
            QRectF(side * edge * 0.19 - edge * 0.09, -edge * 0.36, edge * 0.18, edge * 0.72), 1, 1);
    return path;
}

QPainterPath speakerShape(double edge) {
    QPainterPath path;
    path.moveTo(-edge * 0.42, -edge * 0.14);
    path.lineTo(-edge * 0.24, -edge * 0.14);
    path.lineTo(-edge * 0.02, -edge * 0.34);
    path.lineTo(-edge * 0.02, edge * 0.34);
    path.lineTo(-edge * 0.24, edge * 0.14);
    path.lineTo(-edge * 0.42, edge * 0.14);
    path.closeSubpath();
    return path;
}

void paintSpeaker(QPainter& painter, double edge, bool muted) {
    painter.drawPath(speakerShape(edge));
    painter.setPen(QPen(painter.brush().color(), edge * 0.075, Qt::SolidLine, Qt::RoundCap));
    painter.setBrush(Qt::NoBrush);
    if (muted) {
        painter.drawLine(QPointF(edge * 0.14, -edge * 0.13), QPointF(edge * 0.4, edge * 0.13));
        painter.drawLine(QPointF(edge * 0.14, edge * 0.13), QPointF(edge * 0.4, -edge * 0.13));
        return;
    }
    for (const double radius : {0.2, 0.36}) {
        const QRectF arc(-edge * radius + edge * 0.02, -edge * radius, edge * radius * 2,
                         edge * radius * 2);
        painter.drawArc(arc, -45 * 16, 90 * 16);
    }
}

} // namespace

GlyphButton::GlyphButton(QWidget* parent, std::function<void()> press) : QAbstractButton(parent) {
    setFocusPolicy(Qt::TabFocus);
    setAttribute(Qt::WA_Hover);
    resize(static_cast<int>(Theme::minimumTarget), static_cast<int>(Theme::minimumTarget));
    connect(this, &QAbstractButton::clicked, this, std::move(press));
}

void GlyphButton::setGlyph(Glyph glyph, const QString& name) {
    glyph_ = glyph;
    setAccessibleName(name);
    setToolTip(name);
    update();
}

void GlyphButton::paint(QPainter& painter, Glyph glyph, double edge) {
    painter.save();
    painter.setPen(Qt::NoPen);
    if (glyph == Glyph::play)
        painter.drawPath(playShape(edge));
    else if (glyph == Glyph::pause)
        painter.drawPath(pauseShape(edge));
    else
        paintSpeaker(painter, edge, glyph == Glyph::muted);
    painter.restore();
}

void GlyphButton::paintEvent(QPaintEvent* /*event*/) {
    QPainter painter(this);
    painter.setRenderHint(QPainter::Antialiasing);
    if (underMouse() && isEnabled()) {
        painter.setPen(Qt::NoPen);
        painter.setBrush(toQt(Theme::selection));
        painter.drawRoundedRect(rect().adjusted(2, 2, -2, -2), Theme::buttonCorner,
                                Theme::buttonCorner);
    }
    painter.save();
    painter.setOpacity(isEnabled() ? 1 : Theme::disabledAlpha);
    painter.setBrush(toQt(isDown() ? Theme::accentPressed : Theme::accent));
    painter.translate(QRectF(rect()).center());
    paint(painter, glyph_, glyphEdge);
    painter.restore();
    if (hasFocus())
        paintFocusRing(painter, rect().adjusted(1, 1, -1, -1), Theme::buttonCorner);
}

bool GlyphButton::event(QEvent* event) {
    if (event->type() == QEvent::HoverEnter || event->type() == QEvent::HoverLeave)
        update();
    return QAbstractButton::event(event);
}

LineSlider::LineSlider(QWidget* parent, std::function<void(int)> moved)
    : QAbstractSlider(parent), moved_(std::move(moved)) {
    setOrientation(Qt::Horizontal);
    setFocusPolicy(Qt::TabFocus);
}

void LineSlider::sliderChange(SliderChange change) {
    QAbstractSlider::sliderChange(change);
    update();
}

void LineSlider::paintEvent(QPaintEvent* /*event*/) {
    QPainter painter(this);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setOpacity(isEnabled() ? 1 : Theme::disabledAlpha);
    const double range = std::max(1, maximum() - minimum());
    const double way = width() - 2 * knob;
    const double x = knob + way * (sliderPosition() - minimum()) / range;
    const double middle = height() / 2.0;
    const auto line = [&](double from, double to, const Color& color) {
        painter.setBrush(toQt(color));
        painter.drawRoundedRect(QRectF(from, middle - lineHeight / 2, to - from, lineHeight),
                                lineHeight / 2, lineHeight / 2);
    };
    painter.setPen(Qt::NoPen);
    line(knob, knob + way, Theme::hairline);
    line(knob, x, Theme::accent);
    painter.setBrush(toQt(isSliderDown() ? Theme::accentPressed : Theme::accent));
    painter.drawEllipse(QPointF(x, middle), knob, knob);
    if (hasFocus())
        paintFocusRing(painter, rect().adjusted(0, 6, 0, -6), Theme::buttonCorner);
}

void LineSlider::goTo(double x) {
    const double share = std::clamp((x - knob) / std::max(1.0, width() - 2 * knob), 0.0, 1.0);
    setSliderPosition(minimum() + static_cast<int>(std::lround(share * (maximum() - minimum()))));
    if (drawn_)
        drawn_(sliderPosition());
}

void LineSlider::mousePressEvent(QMouseEvent* event) {
    if (event->button() != Qt::LeftButton)
        return;
    setSliderDown(true);
    goTo(event->position().x());
}

void LineSlider::mouseMoveEvent(QMouseEvent* event) {
    if (isSliderDown())
        goTo(event->position().x());
}

void LineSlider::mouseReleaseEvent(QMouseEvent* event) {
    if (!isSliderDown())
        return;
    goTo(event->position().x());
    setSliderDown(false);
    moved_(value());
}

void LineSlider::keyPressEvent(QKeyEvent* event) {
    const int before = value();
    QAbstractSlider::keyPressEvent(event);
    if (value() != before)
        moved_(value());
}

} // namespace platform
