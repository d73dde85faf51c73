#pragma once

#include "platform/base/Executor.h"

#include <memory>

namespace platform {

/// A repeating timer that fires on a queue. Made suspended; ends with the object. A fire that is
/// late does not bunch up: missed intervals are skipped. The queue and the clock outlive it.
class TimerSource {
public:
    TimerSource(Clock& clock, Executor& queue);
    ~TimerSource();
    TimerSource(const TimerSource&) = delete;
    TimerSource& operator=(const TimerSource&) = delete;

    /// First fire `delay` from now, then every `interval`; the machine may delay a fire by
    /// `leeway`. Takes effect at resume().
    void schedule(Duration delay, Duration interval, Duration leeway = Duration::zero());
    void setHandler(Job handler);
    void resume();
    /// No fire starts after this, except one that already runs on the queue.
    void cancel();

private:
    struct State;
    std::shared_ptr<State> state_;
};

} // namespace platform
