#include "platform/ui/Animation.h"

#include "platform/base/Runtime.h"
#include "platform/ui/qt/Settings.h"

#include <algorithm>
#include <utility>

namespace platform {
namespace {

constexpr Duration frameTime{std::chrono::nanoseconds(1'000'000'000 / 60)};

double eased(double t, AnimationCurve curve) {
    if (curve == AnimationCurve::linear)
        return t;
    const double rest = 1 - t;
    return 1 - rest * rest * rest;
}

} // namespace

struct Animation::State : std::enable_shared_from_this<State> {
    Duration begin{0};
    Duration duration{0};
    AnimationCurve curve = AnimationCurve::linear;
    Step step;
    Job completion;
    Timer timer;

    void run() {
        const Duration elapsed = Runtime::current().clock.monotonic() - begin;
        if (elapsed >= duration) {
            finish();
            return;
        }
        // The last frame falls on the end itself, however the frames lie.
        const Duration wait = std::min(frameTime, duration - elapsed);
        timer = Runtime::current().mainQueue.timer(wait, [weak = weak_from_this()] {
            if (const auto self = weak.lock())
                self->run();
        });
        const Step current = step;
        current(eased(static_cast<double>(elapsed.count()) / static_cast<double>(duration.count()),
                      curve));
    }

    void finish() {
        const auto keep = shared_from_this();
        timer.cancel();
        const Step last = std::exchange(step, {});
        const Job done = std::exchange(completion, {});
        if (last)
            last(1);
        if (done)
            done();
    }
};

Animation::Animation() = default;

Animation::~Animation() {
    stop();
}

void Animation::start(Duration duration, AnimationCurve curve, Step step, Job completion) {
    stop();
    state_ = std::make_shared<State>();
    const auto state = state_;
    state->begin = Runtime::current().clock.monotonic();
    state->duration = reducesMotion() ? Duration::zero() : duration;
    state->curve = curve;
    state->step = std::move(step);
    state->completion = std::move(completion);
    state->run();
}

void Animation::finish() {
    if (const auto state = state_; state && state->step)
        state->finish();
}

void Animation::stop() {
    if (state_) {
        state_->timer.cancel();
        state_->step = {};
        state_->completion = {};
    }
    state_.reset();
}

bool Animation::isRunning() const {
    return state_ && state_->step;
}

} // namespace platform
