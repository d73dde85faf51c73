#include "platform/base/TimerSource.h"

#include <algorithm>
#include <mutex>
#include <utility>

namespace platform {

struct TimerSource::State : std::enable_shared_from_this<State> {
    State(Clock& theClock, Executor& theQueue) : clock(theClock), queue(theQueue) {}

    Clock& clock;
    Executor& queue;
    std::mutex mutex;
    Job handler;
    Duration delay{0};
    Duration interval{0};
    Duration next{0};
    Clock::AlarmId alarm = 0;
    bool active = false;

    /// Called with the lock held.
    void arm() {
        const Duration wait = std::max(next - clock.monotonic(), Duration::zero());
        alarm = clock.setAlarm(wait, [weak = weak_from_this()] {
            if (const auto self = weak.lock())
                self->fire();
        });
    }

    void fire() {
        const std::lock_guard lock(mutex);
        if (!active)
            return;
        queue.async([weak = weak_from_this()] {
            const auto self = weak.lock();
            if (!self)
                return;
            Job job;
            {
                const std::lock_guard inner(self->mutex);
                if (self->active)
                    job = self->handler;
            }
            if (job)
                job();
        });
        if (interval <= Duration::zero()) {
            active = false;
            return;
        }
        next += interval;
        if (const Duration now = clock.monotonic(); next <= now)
            next += interval * ((now - next) / interval + 1);
        arm();
    }
};

TimerSource::TimerSource(Clock& clock, Executor& queue)
    : state_(std::make_shared<State>(clock, queue)) {
}

TimerSource::~TimerSource() {
    cancel();
}

void TimerSource::schedule(Duration delay, Duration interval, Duration /*leeway*/) {
    // The alarm thread coalesces nothing, so every leeway is met.
    const std::lock_guard lock(state_->mutex);
    state_->delay = delay;
    state_->interval = interval;
}

void TimerSource::setHandler(Job handler) {
    const std::lock_guard lock(state_->mutex);
    state_->handler = std::move(handler);
}

void TimerSource::resume() {
    const std::lock_guard lock(state_->mutex);
    if (state_->active)
        return;
    state_->active = true;
    state_->next = state_->clock.monotonic() + state_->delay;
    state_->arm();
}

void TimerSource::cancel() {
    Clock::AlarmId alarm = 0;
    {
        const std::lock_guard lock(state_->mutex);
        state_->active = false;
        alarm = std::exchange(state_->alarm, 0);
    }
    state_->clock.cancelAlarm(alarm);
}

} // namespace platform
