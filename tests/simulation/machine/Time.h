#pragma once

#include "platform/base/AlarmList.h"
#include "platform/base/Clock.h"

namespace simulation {

/// Time of the simulated machine: moves a little with every call of the disk, and as far as the
/// driver wants. The wall clock can be set, as people and time servers do.
class Time final : public platform::Clock {
public:
    platform::Date now() const override { return {wall()}; }
    platform::Duration monotonic() const override { return monotonic_; }
    std::optional<platform::PreciseTime> preciseTime() const override;
    AlarmId setAlarm(platform::Duration delay, platform::Job job) override;
    void cancelAlarm(AlarmId id) override { alarms_.cancel(id); }

    std::int64_t wall() const { return wall_; }
    void creep(platform::Duration step);
    void jump(platform::Duration step) { wall_ += step.count(); }
    std::optional<platform::Duration> nextDue() const { return alarms_.nextDue(); }
    /// Moves on to that moment; nothing runs by it.
    void moveTo(platform::Duration moment);
    /// The first alarm that is due now; empty when there is none.
    platform::Job takeDue() { return alarms_.takeDue(monotonic_); }
    /// Forgets all alarms: a machine that was switched off.
    void forgetAlarms() { alarms_ = {}; }

private:
    platform::AlarmList alarms_;
    platform::Duration monotonic_{std::chrono::seconds(1000)};
    std::int64_t wall_ = 1'700'000'000'000'000'000;
};

} // namespace simulation
