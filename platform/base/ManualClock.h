#pragma once

#include "platform/base/AlarmList.h"
#include "platform/base/Clock.h"

#include <mutex>

namespace platform {

/// A clock that moves only when told: time of tests, of pictures and of simulations.
class ManualClock final : public Clock {
public:
    explicit ManualClock(Date start = Date::fromSeconds(1'700'000'000));

    Date now() const override;
    Duration monotonic() const override;
    std::optional<PreciseTime> preciseTime() const override;
    AlarmId setAlarm(Duration delay, Job job) override;
    void cancelAlarm(AlarmId id) override;

    /// Moves time forward by `step`, running each alarm at its own moment on the calling thread.
    /// `afterEach` runs after every alarm (a test drains its queues there), so that alarms which
    /// the drained work sets within the step run as well.
    void advance(Duration step, const Job& afterEach = {});
    /// Moves the wall clock alone, as a user or a time server does.
    void jumpWallClock(Duration step);
    /// Whether preciseTime() can be read.
    void setPreciseTimeAvailable(bool available);

private:
    mutable std::mutex mutex_;
    AlarmList alarms_;
    Duration monotonic_{std::chrono::seconds(1000)};
    Date wall_;
    bool precise_ = true;
};

} // namespace platform
