#include "tests/simulation/machine/Time.h"

#include <algorithm>

namespace simulation {

std::optional<platform::PreciseTime> Time::preciseTime() const {
    return platform::PreciseTime{wall_ / 1'000'000'000,
                                 static_cast<std::int32_t>(wall_ % 1'000'000'000 / 1000)};
}

platform::Clock::AlarmId Time::setAlarm(platform::Duration delay, platform::Job job) {
    return alarms_.add(monotonic_ + std::max(delay, platform::Duration::zero()), std::move(job));
}

void Time::creep(platform::Duration step) {
    monotonic_ += step;
    wall_ += step.count();
}

void Time::moveTo(platform::Duration moment) {
    if (moment > monotonic_)
        creep(moment - monotonic_);
}

} // namespace simulation
