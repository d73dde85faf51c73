#include "platform/base/ManualClock.h"

#include <algorithm>

namespace platform {

ManualClock::ManualClock(Date start) : wall_(start) {
}

Date ManualClock::now() const {
    const std::lock_guard lock(mutex_);
    return wall_;
}

Duration ManualClock::monotonic() const {
    const std::lock_guard lock(mutex_);
    return monotonic_;
}

std::optional<PreciseTime> ManualClock::preciseTime() const {
    const std::lock_guard lock(mutex_);
    if (!precise_)
        return std::nullopt;
    const std::int64_t seconds = wall_.wholeSeconds();
    const std::int64_t rest = wall_.nanoseconds - seconds * 1'000'000'000;
    return PreciseTime{seconds, static_cast<std::int32_t>(rest / 1000)};
}

Clock::AlarmId ManualClock::setAlarm(Duration delay, Job job) {
    const std::lock_guard lock(mutex_);
    return alarms_.add(monotonic_ + std::max(delay, Duration::zero()), std::move(job));
}

void ManualClock::cancelAlarm(AlarmId id) {
    const std::lock_guard lock(mutex_);
    alarms_.cancel(id);
}

void ManualClock::advance(Duration step, const Job& afterEach) {
    const Duration end = monotonic() + step;
    for (;;) {
        Job job;
        {
            const std::lock_guard lock(mutex_);
            const std::optional<Duration> due = alarms_.nextDue();
            const Duration stop = due && *due <= end ? std::max(*due, monotonic_) : end;
            wall_.nanoseconds += (stop - monotonic_).count();
            monotonic_ = stop;
            job = alarms_.takeDue(monotonic_);
        }
        if (job)
            job();
        if (afterEach)
            afterEach();
        if (!job)
            return;
    }
}

void ManualClock::jumpWallClock(Duration step) {
    const std::lock_guard lock(mutex_);
    wall_.nanoseconds += step.count();
}

void ManualClock::setPreciseTimeAvailable(bool available) {
    const std::lock_guard lock(mutex_);
    precise_ = available;
}

} // namespace platform
