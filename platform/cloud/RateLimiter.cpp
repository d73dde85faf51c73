#include "platform/cloud/RateLimiter.h"

#include <algorithm>
#include <condition_variable>
#include <limits>

namespace platform {
namespace {

/// Portions a second: a progress that moves smoothly, and a cancellation that is felt at once.
constexpr std::uint64_t portionsPerSecond = 8;
constexpr std::uint64_t smallestPortion = 1024;

struct Waiter {
    std::mutex mutex;
    std::condition_variable changed;
    bool ended = false;

    void end() {
        {
            const std::lock_guard lock(mutex);
            ended = true;
        }
        changed.notify_all();
    }
};

} // namespace

RateLimiter::RateLimiter(Clock& clock, std::uint64_t bytesPerSecond)
    : clock_(clock), rate_(bytesPerSecond) {
}

std::size_t RateLimiter::largestPortion() const {
    if (rate_ == 0)
        return std::numeric_limits<std::size_t>::max();
    return std::max(smallestPortion, rate_ / portionsPerSecond);
}

bool RateLimiter::take(std::size_t bytes, CancelFlag& cancel) {
    if (rate_ == 0)
        return !cancel.isCancelled();
    Duration wait{0};
    {
        const std::lock_guard lock(mutex_);
        const Duration now = clock_.monotonic();
        const double seconds = static_cast<double>(bytes) / static_cast<double>(rate_);
        free_ = std::max(free_, now) + Duration(static_cast<std::int64_t>(seconds * 1e9));
        wait = free_ - now;
    }
    const auto waiter = std::make_shared<Waiter>();
    const Clock::AlarmId alarm = clock_.setAlarm(wait, [waiter] { waiter->end(); });
    cancel.setHandler([waiter] { waiter->end(); });
    {
        std::unique_lock lock(waiter->mutex);
        waiter->changed.wait(lock, [&] { return waiter->ended; });
    }
    cancel.setHandler({});
    clock_.cancelAlarm(alarm);
    return !cancel.isCancelled();
}

} // namespace platform
