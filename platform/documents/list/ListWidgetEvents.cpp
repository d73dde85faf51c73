#include "platform/documents/list/ListAccessible.h"
#include "platform/documents/list/ListWidget.h"
#include "platform/ui/qt/Settings.h"
#include "platform/ui/qt/TouchEvents.h"

#include <QContextMenuEvent>
#include <QWheelEvent>

namespace platform {
namespace {

/// One notch of a wheel, in rows.
constexpr double rowsPerNotch = 1.5;
constexpr double notch = 120;

Point fromQt(QPointF point) {
    return {point.x(), point.y()};
}

} // namespace

bool ListWidget::event(QEvent* event) {
    QTouchEvent* const fingers = touchOf(event);
    return fingers ? touch(*fingers) : QWidget::event(event);
}

bool ListWidget::touch(QTouchEvent& event) {
    event.accept();
    if (event.type() == QEvent::TouchCancel || event.points().isEmpty()) {
        pointer_.cancel();
        return true;
    }
    const Point point = fromQt(event.points().constFirst().position());
    if (event.type() == QEvent::TouchBegin) {
        setFocus(Qt::MouseFocusReason);
        pointer_.press(point, true, event.modifiers());
    } else if (event.type() == QEvent::TouchUpdate) {
        pointer_.move(point);
    } else {
        pointer_.release(point);
    }
    return true;
}

void ListWidget::mousePressEvent(QMouseEvent* event) {
    if (event->button() == Qt::LeftButton)
        pointer_.press(fromQt(event->position()), false, event->modifiers());
    else
        QWidget::mousePressEvent(event);
}

void ListWidget::mouseMoveEvent(QMouseEvent* event) {
    if (event->buttons().testFlag(Qt::LeftButton))
        pointer_.move(fromQt(event->position()));
    else
        pointer_.hover(fromQt(event->position()));
}

void ListWidget::mouseReleaseEvent(QMouseEvent* event) {
    if (event->button() == Qt::LeftButton)
        pointer_.release(fromQt(event->position()));
    else
        QWidget::mouseReleaseEvent(event);
}

void ListWidget::leaveEvent(QEvent* event) {
    pointer_.hover(std::nullopt);
    QWidget::leaveEvent(event);
}

void ListWidget::wheelEvent(QWheelEvent* event) {
    const double pixels = event->pixelDelta().y();
    const double notches = event->angleDelta().y() / notch;
    if (pixels != 0)
        state_.scrolling.jumpTo(state_.scrolling.offset() - pixels);
    else if (notches != 0)
        state_.scrolling.glideBy(-notches * rowsPerNotch * state_.style.rowHeight);
    if (state_.swipe.row())
        state_.swipe.close();
    pointer_.hover(fromQt(event->position()));
    event->accept();
}

void ListWidget::keyPressEvent(QKeyEvent* event) {
    const std::optional<RowId> former = state_.current;
    if (!keys_.press(*event)) {
        QWidget::keyPressEvent(event);
        return;
    }
    if (state_.current != former)
        announceCurrentRow(*this);
    update();
}

void ListWidget::contextMenuEvent(QContextMenuEvent* event) {
    const bool byKey = event->reason() == QContextMenuEvent::Keyboard;
    const std::optional<std::size_t> index =
        byKey ? state_.indexOf(state_.current) : state_.rowAt(event->pos().y());
    event->accept();
    if (!index)
        return;
    state_.setCurrent(*index);
    const QPoint at = event->pos();
    state_.askForActions(*index,
                         byKey ? state_.moreRect(*index) : Rect{at.x() - 1.0, at.y() - 1.0, 2, 2});
}

void ListWidget::focusInEvent(QFocusEvent* event) {
    state_.hasFocus = true;
    if (!state_.current && state_.model.count() > 0)
        if (const auto first = state_.allowedAround(state_.firstWholeInView()))
            state_.current = state_.model.idAt(*first);
    const auto index = state_.indexOf(state_.current);
    // The toolkit gives the same reason when it looks for a place for the focus by itself.
    const bool byKey = showsKeyboardFocus() && (event->reason() == Qt::TabFocusReason ||
                                                event->reason() == Qt::BacktabFocusReason);
    if (byKey && index && (*index < state_.firstInView() || *index >= state_.endInView()))
        state_.reveal(*index, false);
    announceCurrentRow(*this);
    update();
}

void ListWidget::focusOutEvent(QFocusEvent* /*event*/) {
    state_.hasFocus = false;
    update();
}

} // namespace platform
