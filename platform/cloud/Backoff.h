#pragma once

#include "platform/base/Clock.h"

#include <algorithm>
#include <cstdint>

namespace platform {

/// How long to wait before the next try: doubling from two seconds up to five minutes, less up to a
/// quarter, so that many who wait for the same thing do not all come at once.
class Backoff {
public:
    explicit Backoff(std::uint64_t seed) : random_(seed | 1) {}

    Duration next() {
        const Duration full = std::min<Duration>(first * (1LL << std::min(tries_++, 10)), longest);
        random_ ^= random_ << 13;
        random_ ^= random_ >> 7;
        random_ ^= random_ << 17;
        return full - full / 4 * static_cast<std::int64_t>(random_ % 1000) / 1000;
    }
    void reset() { tries_ = 0; }

private:
    static constexpr Duration first = std::chrono::seconds(2);
    static constexpr Duration longest = std::chrono::minutes(5);
    std::uint64_t random_;
    int tries_ = 0;
};

} // namespace platform
