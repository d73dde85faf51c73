#pragma once

#include <compare>
#include <cstdint>
#include <string>

namespace platform {

/// A moment of wall-clock time, nanoseconds since 1970-01-01 UTC.
struct Date {
    std::int64_t nanoseconds = 0;

    static constexpr Date fromSeconds(double seconds) {
        return {static_cast<std::int64_t>(seconds * 1e9)};
    }
    static constexpr Date fromParts(std::int64_t seconds, std::int64_t nanos) {
        return {seconds * 1'000'000'000 + nanos};
    }
    constexpr double seconds() const { return static_cast<double>(nanoseconds) / 1e9; }
    constexpr std::int64_t wholeSeconds() const {
        const std::int64_t q = nanoseconds / 1'000'000'000;
        return nanoseconds % 1'000'000'000 < 0 ? q - 1 : q;
    }
    /// Seconds from `earlier` to this moment; negative when `earlier` is the later one.
    constexpr double secondsSince(Date earlier) const {
        return static_cast<double>(nanoseconds - earlier.nanoseconds) / 1e9;
    }
    auto operator<=>(const Date&) const = default;
};

/// "2026-11-22 20:14:05 +0000", for logs; screens use platform/base/DateFormat.h.
void appendDescription(std::string& out, Date date);

} // namespace platform
