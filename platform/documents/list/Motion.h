#pragma once

#include "platform/base/Clock.h"

#include <cmath>

// How what was thrown slows down; the same in lists and in documents.
namespace platform::motion {

/// A fling loses all but a third of its speed in this time.
inline constexpr double slowing = 0.325;   // seconds
inline constexpr double slowestFling = 60; // points a second
inline constexpr double slowestMotion = 12;

/// How long a fling of that speed goes on.
inline double flingSeconds(double speed) {
    return slowing * std::log(std::abs(speed) / slowestMotion);
}
/// The way after that many seconds, for a speed of 1.
inline double flingShare(double seconds) {
    return slowing * (1 - std::exp(-seconds / slowing));
}
inline Duration duration(double seconds) {
    return Duration(static_cast<Duration::rep>(seconds * 1e9));
}

} // namespace platform::motion
