#include "platform/documents/list/Scrolling.h"

#include "platform/documents/list/Motion.h"
#include "platform/ui/Application.h"

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

/// A list drawn beyond its end follows the finger by this share.
constexpr double resistance = 0.45;
constexpr Duration glideTime = std::chrono::milliseconds(160);
constexpr Duration returnTime = std::chrono::milliseconds(240);

} // namespace

double Scrolling::maximum() const {
    return std::max(0.0, content_ - viewport_);
}

double Scrolling::clamped(double offset) const {
    return std::clamp(offset, 0.0, maximum());
}

void Scrolling::setExtent(double viewport, double content, double shift) {
    viewport_ = viewport;
    content_ = content;
    if (motion_.isRunning()) {
        shifted_ += shift;
        target_ += shift;
    }
    // What is drawn beyond an end is on its way back, or in a hand.
    if (shift != 0 || offset_ > maximum())
        place(clamped(offset_ + shift));
}

void Scrolling::jumpTo(double offset) {
    motion_.stop();
    place(clamped(offset));
}

void Scrolling::glideTo(double offset) {
    const double from = offset_;
    target_ = clamped(offset);
    shifted_ = 0;
    gliding_ = true;
    motion_.start(
        glideTime, AnimationCurve::easeOut,
        [this, from, to = target_](double progress) {
            place(clamped(from + (to - from) * progress + shifted_));
        },
        [this] { gliding_ = false; });
}

void Scrolling::glideBy(double distance) {
    glideTo((motion_.isRunning() && gliding_ ? target_ : offset_) + distance);
}

void Scrolling::dragTo(double offset) {
    motion_.stop();
    const double inside = clamped(offset);
    place(inside + (offset - inside) * resistance);
}

void Scrolling::release(double speed) {
    const double inside = clamped(offset_);
    if (inside != offset_) {
        const double from = offset_;
        gliding_ = false;
        motion_.start(returnTime, AnimationCurve::easeOut, [this, from, inside](double progress) {
            place(from + (inside - from) * progress);
        });
        return;
    }
    // A jump over the whole way of a fling would lose the reader's place.
    if (std::abs(speed) >= motion::slowestFling && !Application::shared().reducesMotion())
        fling(speed);
}

void Scrolling::fling(double speed) {
    const double from = offset_;
    const double seconds = motion::flingSeconds(speed);
    shifted_ = 0;
    gliding_ = false;
    motion_.start(motion::duration(seconds), AnimationCurve::linear,
                  [this, from, speed, seconds](double progress) {
                      const double wanted =
                          from + speed * motion::flingShare(progress * seconds) + shifted_;
                      place(clamped(wanted));
                      if (progress < 1 && clamped(wanted) != wanted)
                          motion_.stop();
                  });
}

void Scrolling::place(double offset) {
    if (offset == offset_)
        return;
    offset_ = offset;
    moved_();
}

} // namespace platform
