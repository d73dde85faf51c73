#pragma once

#include "platform/ui/Animation.h"

#include <functional>

namespace platform {

/// How far a list is scrolled: drags with resistance at the ends, flings that slow down, and jumps.
/// Points; time is the platform's.
class Scrolling {
public:
    /// `moved` is called after every change of the offset.
    explicit Scrolling(std::function<void()> moved) : moved_(std::move(moved)) {}

    double offset() const { return offset_; }
    double viewport() const { return viewport_; }
    double maximum() const;
    /// How far the list is drawn beyond its top; 0 when it is not.
    double pulled() const { return offset_ < 0 ? -offset_ : 0; }
    bool isMoving() const { return motion_.isRunning(); }

    /// Keeps the offset within what is there, after the content at it has moved by `shift`. What
    /// glides goes on from there.
    void setExtent(double viewport, double content, double shift = 0);
    /// At once; ends what moves.
    void jumpTo(double offset);
    void glideTo(double offset);
    void glideBy(double distance);

    /// The place that a finger draws to, counted from where it came down.
    void dragTo(double offset);
    /// The finger was lifted at that speed, in points a second; positive goes toward the end.
    void release(double speed);
    void stop() { motion_.stop(); }

private:
    double clamped(double offset) const;
    void place(double offset);
    void fling(double speed);

    std::function<void()> moved_;
    double offset_ = 0;
    double viewport_ = 0;
    double content_ = 0;
    /// Where a glide ends: the next turn of the wheel adds to it.
    double target_ = 0;
    bool gliding_ = false;
    /// What the content moved while something moves.
    double shifted_ = 0;
    Animation motion_;
};

} // namespace platform
