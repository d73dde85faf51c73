#pragma once

#include "platform/base/Clock.h"
#include "platform/files/ContentProvider.h"

#include <cstdint>
#include <memory>
#include <mutex>

namespace platform {

/// Holds all transfers of an account together below a rate. Safe from any thread.
class RateLimiter {
public:
    /// `bytesPerSecond` 0 is no limit.
    RateLimiter(Clock& clock, std::uint64_t bytesPerSecond);

    /// Blocks for as long as so many bytes take at the rate, in turn with other callers. False when
    /// cancelled. Uses the flag's handler while it waits.
    bool take(std::size_t bytes, CancelFlag& cancel);
    /// Callers take their bytes in portions of at most this, so that nobody waits long in one go.
    std::size_t largestPortion() const;

private:
    Clock& clock_;
    const std::uint64_t rate_;
    std::mutex mutex_;
    Duration free_{0}; // when the bytes given out so far have had their time; guarded by mutex_
};

} // namespace platform
