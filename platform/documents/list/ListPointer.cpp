#include "platform/documents/list/ListPointer.h"

#include "platform/base/Runtime.h"
#include "platform/ui/Application.h"

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

constexpr double slop = 10;
constexpr Duration longPressTime = std::chrono::milliseconds(500);
/// A row that only passes under a scrolling finger does not light up.
constexpr Duration markTime = std::chrono::milliseconds(70);

/// On a phone a mouse stands for the finger: nobody has one there but who tries the program.
bool mouseIsFinger() {
    return Application::shared().idiom() == DeviceIdiom::phone;
}

} // namespace

ListPointer::ListPointer(ListState& state, Handlers handlers)
    : state_(state), handlers_(std::move(handlers)) {
}

void ListPointer::press(Point point, bool finger, Qt::KeyboardModifiers modifiers) {
    finger_ = finger || mouseIsFinger();
    modifiers_ = modifiers;
    start_ = point;
    drag_.forget();
    drag_.track(point);
    hit_ = state_.hit(point);
    row_ = hit_.part == ListHit::Part::nothing ? std::nullopt
                                               : std::optional(state_.model.idAt(hit_.index));
    if (state_.scrolling.isMoving()) {
        // Stops the list; what came to lie under the finger was not meant.
        state_.scrolling.stop();
        beginScrolling(point);
        return;
    }
    if (hit_.part == ListHit::Part::swipeAction) {
        phase_ = Phase::pressed;
        state_.swipe.setPressed(hit_.action);
        return;
    }
    phase_ = Phase::pressed;
    if (state_.swipe.isOpen() && state_.swipe.row() != row_) {
        state_.swipe.close();
        phase_ = Phase::ended;
        return;
    }
    MainQueue& queue = Runtime::current().mainQueue;
    if (finger_ && !state_.editing)
        longPress_ = queue.timer(longPressTime, [this] { longPress(); });
    if (!row_ || hit_.part != ListHit::Part::row || !state_.allows(hit_.index))
        return;
    mark_ = queue.timer(finger_ ? markTime : Duration::zero(), [this] {
        state_.pressed = row_;
        handlers_.repaint();
    });
}

void ListPointer::move(Point point) {
    drag_.track(point);
    if (phase_ == Phase::pressed)
        decide(point);
    if (phase_ == Phase::scrolling)
        state_.scrolling.dragTo(originOffset_ - (point.y - origin_.y));
    else if (phase_ == Phase::swiping)
        state_.swipe.dragTo((origin_.x - point.x) * (state_.style.rightToLeft ? -1 : 1));
}

/// The first stretch of the way says what is meant.
void ListPointer::decide(Point point) {
    const double across = std::abs(point.x - start_.x);
    const double along = std::abs(point.y - start_.y);
    if (std::max(across, along) < slop)
        return;
    // The row may have gone since it was pressed.
    const bool swipes =
        state_.indexOf(row_) && !state_.editing && state_.client->listActions() != 0;
    if (across > along && swipes)
        beginSwiping(point);
    else if (finger_)
        beginScrolling(point);
    else
        phase_ = across > slop || along > slop ? Phase::ended : phase_;
    if (phase_ != Phase::pressed)
        unmark();
}

void ListPointer::beginScrolling(Point point) {
    phase_ = Phase::scrolling;
    origin_ = point;
    originOffset_ = state_.scrolling.offset();
    if (state_.swipe.row())
        state_.swipe.close();
}

void ListPointer::beginSwiping(Point point) {
    phase_ = Phase::swiping;
    origin_ = point;
    state_.swipe.begin(*row_, offeredActions(state_.client->listActions()), state_.size.width);
}

void ListPointer::release(Point point) {
    drag_.track(point);
    const Phase former = std::exchange(phase_, Phase::idle);
    const bool pulled =
        former == Phase::scrolling && finger_ && state_.scrolling.pulled() > pullDistance;
    if (former == Phase::swiping) {
        state_.swipe.release(-drag_.speed().x * (state_.style.rightToLeft ? -1 : 1));
    } else if (former == Phase::scrolling) {
        if (pulled)
            handlers_.pulled();
        state_.scrolling.release(-drag_.speed().y);
    } else if (former == Phase::pressed) {
        tap();
    }
    unmark();
}

void ListPointer::tap() {
    const std::optional<std::size_t> index = state_.indexOf(row_);
    if (!index)
        return;
    if (hit_.part == ListHit::Part::swipeAction) {
        const Rect row = state_.rowRect(*index);
        Rect button = state_.swipe.buttonRect(hit_.action, row.size());
        button.y = row.y;
        if (state_.style.rightToLeft)
            button.x = row.width - button.maxX();
        state_.chooseAction(hit_.action, *index, button);
        return;
    }
    if (state_.swipe.row()) {
        state_.swipe.close();
        return;
    }
    if (!state_.allows(*index))
        return;
    state_.setCurrent(*index);
    if (hit_.part == ListHit::Part::more) {
        state_.askForActions(*index, state_.moreRect(*index));
    } else if (state_.editing && modifiers_.testFlag(Qt::ShiftModifier)) {
        if (state_.selection.extendTo(state_.model, *index))
            state_.client->listSelectionDidChange();
        handlers_.repaint();
    } else {
        state_.activate(*index);
    }
}

void ListPointer::longPress() {
    const std::optional<std::size_t> index = state_.indexOf(row_);
    if (phase_ != Phase::pressed || !index || hit_.part == ListHit::Part::swipeAction)
        return;
    phase_ = Phase::ended;
    unmark();
    state_.askForActions(*index, state_.moreRect(*index));
}

void ListPointer::cancel() {
    const Phase former = std::exchange(phase_, Phase::idle);
    if (former == Phase::scrolling)
        state_.scrolling.release(0);
    else if (former == Phase::swiping)
        state_.swipe.close();
    unmark();
}

void ListPointer::hover(std::optional<Point> point) {
    const std::optional<std::size_t> index = point && point->x >= 0 && point->x < state_.size.width
                                                 ? state_.rowAt(point->y)
                                                 : std::nullopt;
    const std::optional<RowId> row =
        index ? std::optional(state_.model.idAt(*index)) : std::nullopt;
    if (row == state_.hovered)
        return;
    state_.hovered = row;
    handlers_.repaint();
}

void ListPointer::unmark() {
    longPress_.cancel();
    mark_.cancel();
    if (state_.swipe.row())
        state_.swipe.setPressed(std::nullopt);
    if (!state_.pressed)
        return;
    state_.pressed.reset();
    handlers_.repaint();
}

} // namespace platform
