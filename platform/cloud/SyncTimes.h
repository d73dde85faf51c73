#pragma once

#include "platform/base/Clock.h"

// How long the engine waits for what.

namespace platform {

/// A file that was written to a moment ago may be written to again without a new time: disks count
/// time in ticks, some in whole seconds. And whoever writes a file often writes on.
inline constexpr Duration settleTime = std::chrono::milliseconds(500);
inline constexpr Duration coarseSettleTime = std::chrono::milliseconds(2500);

/// How long a content of that modification time may have successors that look the same.
constexpr Duration settleTimeOf(Date modified) {
    return modified.nanoseconds % 1'000'000'000 == 0 ? coarseSettleTime : settleTime;
}
constexpr bool isYoung(Date modified, Date now) {
    const Duration age(now.nanoseconds - modified.nanoseconds);
    return age >= Duration::zero() && age < settleTimeOf(modified);
}

/// Notices of changes are gathered for this long before the folders are looked at.
inline constexpr Duration noticeDelay = std::chrono::milliseconds(50);
/// How often a remote is asked that cannot be watched.
inline constexpr Duration pollInterval = std::chrono::minutes(1);
/// How often everything is looked at although no notice came.
inline constexpr Duration sweepInterval = std::chrono::hours(1);
/// When what vanished is looked for a second time before it counts as deleted: by then whoever
/// deletes a tree has come further, and more is gone.
inline constexpr Duration secondLookDelay = std::chrono::milliseconds(1000);
/// Deletions of so long a time are counted together where it is asked whether they are too many.
inline constexpr Duration deletionMemory = std::chrono::minutes(5);

} // namespace platform
