#include "platform/documents/list/ListWidget.h"

#include "platform/base/Text.h"
#include "platform/documents/list/ListAccessible.h"
#include "platform/ui/Application.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"

#include <QContextMenuEvent>
#include <QScrollBar>
#include <QWheelEvent>

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

/// One notch of a wheel, in rows.
constexpr double rowsPerNotch = 1.5;
constexpr double notch = 120;
constexpr int scrollBarWidth = 12;
/// A scroll bar counts in whole numbers of 31 bits.
constexpr double longestScrollBar = 1e9;
/// Beyond what the list is wide, so that a row half drawn in has its details already.
constexpr std::size_t rowsAhead = 4;

Point fromQt(QPointF point) {
    return {point.x(), point.y()};
}

} // namespace

ListWidget::ListWidget(std::shared_ptr<RowModel> model, ListClient& client)
    : state_(
          std::move(model), client, [this] { scrolled(); }, [this] { update(); }),
      pointer_(state_, {[this] { update(); }, [this] { askForRefresh(); }}),
      keys_(state_, [this] { askForRefresh(); }),
      scrollBar_(new QScrollBar(Qt::Vertical, this)) {
    // Before anything that tells screen readers of this widget.
    installListAccessibility();
    setFocusPolicy(Qt::StrongFocus);
    setMouseTracking(true);
    setAttribute(Qt::WA_AcceptTouchEvents);
    setAccessibleName(toQt(localized("Documents")));
    scrollBar_->setFocusPolicy(Qt::NoFocus);
    scrollBar_->hide();
    QObject::connect(scrollBar_, &QScrollBar::valueChanged, this, [this](int value) {
        const double wanted = value * scrollUnit_;
        if (std::abs(wanted - state_.scrolling.offset()) >= scrollUnit_)
            state_.scrolling.jumpTo(wanted);
    });
    state_.model.setObserver(this);
    measure();
}

ListWidget::~ListWidget() {
    state_.model.setObserver(nullptr);
}

void ListWidget::setHeaderHeight(double height) {
    if (height == state_.header)
        return;
    state_.header = height;
    measure();
}

void ListWidget::setShowsPlaceholders(bool shown) {
    placeholders_ = shown;
    update();
}

void ListWidget::setChangeHandlers(std::function<void()> rows, std::function<void()> modelState) {
    rowsChanged_ = std::move(rows);
    modelStateChanged_ = std::move(modelState);
}

void ListWidget::measure() {
    state_.size = {static_cast<double>(width()), static_cast<double>(height())};
    state_.measure();
    updateScrollBar();
    tellRowsInView();
    update();
}

void ListWidget::scrolled() {
    updateScrollBar();
    tellRowsInView();
    update();
    state_.client->listDidScroll();
}

void ListWidget::updateScrollBar() {
    const Scrolling& scrolling = state_.scrolling;
    const bool shown =
        scrolling.maximum() > 0 && Application::shared().idiom() != DeviceIdiom::phone;
    scrollBar_->setVisible(shown);
    if (!shown)
        return;
    scrollUnit_ = std::max(1.0, scrolling.maximum() / longestScrollBar);
    const QSignalBlocker quiet(scrollBar_);
    scrollBar_->setRange(0, static_cast<int>(scrolling.maximum() / scrollUnit_));
    scrollBar_->setPageStep(static_cast<int>(std::max(1.0, scrolling.viewport() / scrollUnit_)));
    scrollBar_->setSingleStep(static_cast<int>(state_.style.rowHeight));
    scrollBar_->setValue(static_cast<int>(scrolling.offset() / scrollUnit_));
}

void ListWidget::tellRowsInView() {
    const std::size_t first = state_.firstInView();
    state_.model.setRowsInView(first - std::min(first, rowsAhead), state_.endInView() + rowsAhead);
}

// Changes of the rows

void ListWidget::rowsWillChange() {
    landmarks_.clear();
    const std::size_t end = state_.endInView();
    for (std::size_t i = state_.firstInView(); i < end; ++i)
        landmarks_.push_back({state_.model.idAt(i), state_.yOf(i)});
    currentIndex_ = state_.indexOf(state_.current).value_or(0);
}

void ListWidget::rowsDidChange() {
    state_.spans.update(state_.model, state_.style, state_.header);
    keepPlace();
    keepCurrent();
    const bool selectionChanged = state_.selection.prune(state_.model);
    if (state_.swipe.row() && !state_.model.contains(*state_.swipe.row()))
        state_.swipe.forget();
    if (state_.pending && !state_.model.contains(*state_.pending))
        state_.pending.reset();
    state_.contents.clear();
    measure();
    announceRowsChanged(*this);
    if (selectionChanged)
        state_.client->listSelectionDidChange();
    if (rowsChanged_)
        rowsChanged_();
}

/// Moves the offset with the rows that were in view. Most of them have moved by the same distance;
/// one that was renamed has gone elsewhere and must not take the view along.
void ListWidget::keepPlace() {
    // At the top people want to see what comes in.
    if (state_.scrolling.offset() <= 0)
        return;
    std::vector<double> distances;
    for (const Landmark& landmark : landmarks_)
        if (const std::optional<std::size_t> index = state_.model.indexOf(landmark.row))
            distances.push_back(state_.yOf(*index) - landmark.y);
    if (distances.empty())
        return;
    const auto middle = distances.begin() + static_cast<std::ptrdiff_t>(distances.size() / 2);
    std::nth_element(distances.begin(), middle, distances.end());
    state_.scrolling.setExtent(state_.size.height, state_.spans.total(), *middle);
}

/// The keyboard's row is gone: the one in its place is the next.
void ListWidget::keepCurrent() {
    if (!state_.current || state_.model.contains(*state_.current))
        return;
    state_.current.reset();
    if (const auto next = state_.allowedAround(currentIndex_))
        state_.current = state_.model.idAt(*next);
}

void ListWidget::rowContentDidChange(const std::vector<RowId>& rows) {
    state_.contents.forget(rows);
    update();
}

void ListWidget::modelStateDidChange() {
    if (modelStateChanged_)
        modelStateChanged_();
    update();
}

// Events

bool ListWidget::event(QEvent* event) {
    switch (event->type()) {
    case QEvent::TouchBegin:
    case QEvent::TouchUpdate:
    case QEvent::TouchEnd:
    case QEvent::TouchCancel:
        return touch(static_cast<QTouchEvent&>(*event));
    default:
        return QWidget::event(event);
    }
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
    const bool byKey =
        event->reason() == Qt::TabFocusReason || event->reason() == Qt::BacktabFocusReason;
    if (byKey && index && (*index < state_.firstInView() || *index >= state_.endInView()))
        state_.reveal(*index, false);
    announceCurrentRow(*this);
    update();
}

void ListWidget::focusOutEvent(QFocusEvent* /*event*/) {
    state_.hasFocus = false;
    update();
}

void ListWidget::changeEvent(QEvent* event) {
    QWidget::changeEvent(event);
    if (event->type() == QEvent::LayoutDirectionChange || event->type() == QEvent::FontChange)
        measure();
}

void ListWidget::resizeEvent(QResizeEvent* event) {
    QWidget::resizeEvent(event);
    const bool rightToLeft = layoutDirection() == Qt::RightToLeft;
    scrollBar_->setGeometry(rightToLeft ? 0 : width() - scrollBarWidth, 0, scrollBarWidth,
                            height());
    measure();
}

} // namespace platform
