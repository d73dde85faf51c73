#include "platform/documents/list/ListWidget.h"

#include "platform/base/Text.h"
#include "platform/documents/list/ListAccessible.h"
#include "platform/ui/Application.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"

#include <QEvent>
#include <QScrollBar>

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

constexpr int scrollBarWidth = 12;
/// A scroll bar counts in whole numbers of 31 bits.
constexpr double longestScrollBar = 1e9;
/// Beyond what the list is wide, so that a row half drawn in has its details already.
constexpr std::size_t rowsAhead = 4;

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
    followThumbnails();
}

void ListWidget::followThumbnails() {
    state_.thumbnails.follow(state_.model, state_.firstInView(), state_.endInView(),
                             devicePixelRatioF());
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
/// Who is in the list with the keys is on a row as soon as there is one.
void ListWidget::keepCurrent() {
    if (state_.current ? state_.model.contains(*state_.current) : !state_.hasFocus)
        return;
    const std::size_t wanted = state_.current ? currentIndex_ : state_.firstWholeInView();
    state_.current.reset();
    if (const auto next = state_.allowedAround(wanted))
        state_.current = state_.model.idAt(*next);
}

void ListWidget::rowContentDidChange(const std::vector<RowId>& rows) {
    state_.contents.forget(rows);
    followThumbnails();
    update();
}

void ListWidget::modelStateDidChange() {
    if (modelStateChanged_)
        modelStateChanged_();
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
