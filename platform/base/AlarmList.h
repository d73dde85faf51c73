#pragma once

#include "platform/base/Clock.h"

#include <map>
#include <optional>
#include <unordered_map>
#include <utility>

namespace platform {

/// Alarms in the order in which they are due; equal times keep the order in which they were set.
/// Not thread-safe: the clock that owns it holds its lock.
class AlarmList {
public:
    Clock::AlarmId add(Duration due, Job job);
    void cancel(Clock::AlarmId id);
    std::optional<Duration> nextDue() const;
    /// Takes the first alarm that is due at `now`; none when there is no such alarm.
    Job takeDue(Duration now);

private:
    using Key = std::pair<Duration, Clock::AlarmId>;
    std::map<Key, Job> alarms_;
    std::unordered_map<Clock::AlarmId, Duration> dues_;
    Clock::AlarmId last_ = 0;
};

} // namespace platform
