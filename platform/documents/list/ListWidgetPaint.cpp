#include "platform/documents/list/ListWidget.h"

#include "platform/ui/Application.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"

#include <QPaintEvent>
#include <QPainter>
#include <QScrollBar>

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

constexpr double pullRing = 24;
constexpr Duration turnTime = std::chrono::milliseconds(900);

} // namespace

void ListWidget::paintEvent(QPaintEvent* event) {
    // The settings have no notice of their own; whoever changes them repaints everything.
    if (!state_.style.isCurrent())
        measure();
    QPainter painter(this);
    painter.setRenderHint(QPainter::Antialiasing);
    // The parts of a second line stand in the program's order, whatever they are written in.
    painter.setLayoutDirection(state_.style.rightToLeft ? Qt::RightToLeft : Qt::LeftToRight);
    if (state_.model.count() == 0 && placeholders_)
        paintPlaceholders(painter);
    else
        paintRows(painter, event->rect());
    paintPull(painter);
}

void ListWidget::paintRows(QPainter& painter, const QRectF& dirty) {
    const std::size_t end = state_.endInView();
    for (std::size_t i = state_.firstInView(); i < end; ++i)
        if (toQt(state_.rowRect(i)).intersects(dirty))
            paintOneRow(painter, i);
}

void ListWidget::paintOneRow(QPainter& painter, std::size_t index) {
    const QRectF area = toQt(state_.rowRect(index));
    RowContent& content = state_.contents.at(state_.model, index);
    RowLook look = state_.lookOf(index);
    if (state_.swipe.row() != state_.model.idAt(index) || state_.swipe.distance() <= 0) {
        paintRow(painter, area, content, look, state_.style);
        return;
    }
    painter.save();
    painter.setClipRect(area, Qt::IntersectClip);
    state_.swipe.paint(painter, area);
    // The row gives way instead of moving out, so that one sees whose actions these are.
    const double width = area.width() - state_.swipe.distance();
    const double left = state_.style.rightToLeft ? area.right() - width : area.left();
    const QRectF rest(left, area.top(), width, area.height());
    painter.fillRect(rest, toQt(Theme::page));
    look.aside = true;
    paintRow(painter, rest, content, look, state_.style);
    painter.restore();
}

void ListWidget::paintPlaceholders(QPainter& painter) {
    double y = state_.header;
    for (std::size_t i = 0; y < height(); ++i, y += state_.style.rowHeight)
        paintPlaceholderRow(painter, QRectF(0, y, width(), state_.style.rowHeight), state_.style,
                            i);
}

double ListWidget::pulledShare() const {
    return refreshing_ ? 1 : std::min(1.0, state_.scrolling.pulled() / pullDistance);
}

/// The ring that fills while the list is drawn down, and turns while it is read again.
void ListWidget::paintPull(QPainter& painter) {
    const double share = pulledShare();
    if (share <= 0.05)
        return;
    const double top = refreshing_ ? std::max(12.0, state_.scrolling.pulled() / 2 - pullRing / 2)
                                   : state_.scrolling.pulled() / 2 - pullRing / 2;
    const QRectF ring((width() - pullRing) / 2, top, pullRing, pullRing);
    painter.setPen(Qt::NoPen);
    painter.setBrush(toQt(Theme::page));
    painter.drawEllipse(ring.adjusted(-5, -5, 5, 5));
    painter.setBrush(Qt::NoBrush);
    painter.setPen(QPen(toQt(Theme::accent), 2.5, Qt::SolidLine, Qt::RoundCap));
    const double start = 90 - (refreshing_ ? spin_ * 360 : 0);
    const double length = refreshing_ ? 270 : share * 330;
    painter.drawArc(ring, static_cast<int>(start * 16), static_cast<int>(-length * 16));
}

void ListWidget::askForRefresh() {
    if (refreshing_ || !state_.client->listCanRefresh())
        return;
    refreshing_ = true;
    spin();
    state_.client->listDidAskForRefresh([this, weak = std::weak_ptr(alive_)] {
        if (weak.expired())
            return;
        refreshing_ = false;
        spinning_.stop();
        update();
    });
}

void ListWidget::spin() {
    spinning_.start(
        turnTime, AnimationCurve::linear,
        [this](double progress) {
            spin_ = progress;
            update();
        },
        [this] {
            if (refreshing_ && !Application::shared().reducesMotion())
                spin();
        });
}

} // namespace platform
