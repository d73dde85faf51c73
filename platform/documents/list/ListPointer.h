#pragma once

#include "platform/base/MainQueue.h"
#include "platform/documents/list/DragSpeed.h"
#include "platform/documents/list/ListState.h"

#include <Qt>

#include <functional>
#include <optional>

namespace platform {

/// How far a list is drawn down, as seen, before letting go means "read again".
inline constexpr double pullDistance = 64;

/// What a finger or a mouse does to a list: taps, long presses, scrolling, drawing rows aside and
/// pulling down. A finger scrolls; a mouse has the wheel and the scroll bar.
class ListPointer {
public:
    struct Handlers {
        std::function<void()> repaint;
        /// The list was drawn down far enough and let go.
        std::function<void()> pulled;
    };
    ListPointer(ListState& state, Handlers handlers);

    void press(Point point, bool finger, Qt::KeyboardModifiers modifiers);
    void move(Point point);
    void release(Point point);
    /// Somebody else has taken the finger (a swipe back), or the window lost it.
    void cancel();
    void hover(std::optional<Point> point);

private:
    enum class Phase {
        idle,
        /// Down, and not known yet what for.
        pressed,
        scrolling,
        swiping,
        /// Over: the rest of the touch means nothing.
        ended
    };
    void decide(Point point);
    void beginScrolling(Point point);
    void beginSwiping(Point point);
    void tap();
    void longPress();
    void unmark();

    ListState& state_;
    Handlers handlers_;
    Phase phase_ = Phase::idle;
    bool finger_ = false;
    Qt::KeyboardModifiers modifiers_;
    Point start_;
    /// Where scrolling or swiping began, and the offset then.
    Point origin_;
    double originOffset_ = 0;
    ListHit hit_;
    std::optional<RowId> row_;
    DragSpeed drag_;
    Timer longPress_;
    Timer mark_;
};

} // namespace platform
