#pragma once

#include "platform/base/Date.h"

#include <chrono>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>

namespace platform {

using Job = std::function<void()>;
using Duration = std::chrono::nanoseconds;

/// Seconds and microseconds of one clock reading.
struct PreciseTime {
    std::int64_t seconds = 0;
    std::int32_t microseconds = 0;
};

/// The source of all time: wall clock, monotonic clock and alarms. The real one reads the machine;
/// a test's stands still until it is moved. Safe to use from any thread.
class Clock {
public:
    using AlarmId = std::uint64_t;

    virtual ~Clock() = default;

    virtual Date now() const = 0;
    /// Never goes back; unrelated to wall time.
    virtual Duration monotonic() const = 0;
    /// The precise wall clock; none when it cannot be read.
    virtual std::optional<PreciseTime> preciseTime() const = 0;

    /// Runs `job` once, `delay` from now, on a thread of the clock's choosing; it must be short and
    /// hand real work to a queue. Never 0.
    virtual AlarmId setAlarm(Duration delay, Job job) = 0;
    /// The job will not start after this returns; one that already runs is not waited for.
    virtual void cancelAlarm(AlarmId id) = 0;
};

std::unique_ptr<Clock> makeRealClock();

} // namespace platform
