#pragma once

#include <cstdint>

namespace platform {

/// What the drawer of pictures, a process of its own, writes to its output: this, and behind it,
/// when it says drawn, the rows of the picture, 4 bytes a pixel, multiplied by their alpha.
struct DrawnHead {
    enum class State : std::int32_t { drawn = 1, damaged = 2, tooLarge = 3 };
    State state = State::damaged;
    /// As the file says it; 1 at least.
    std::int32_t fullWidth = 0;
    std::int32_t fullHeight = 0;
    /// As it was drawn.
    std::int32_t width = 0;
    std::int32_t height = 0;
};

/// No drawing has more: four times the pixels of a large screen, 32 MB.
inline constexpr double mostDrawnPixels = 8e6;
/// The painter's own limit of coordinates.
inline constexpr double longestDrawnEdge = 32'000;

} // namespace platform
