#pragma once

namespace platform {

/// A colour in sRGB; each component from 0 to 1.
struct Color {
    double red = 0;
    double green = 0;
    double blue = 0;
    double alpha = 1;

    static constexpr Color gray(double level, double alpha = 1) {
        return {level, level, level, alpha};
    }
    /// From 0xRRGGBB.
    static constexpr Color hex(unsigned rgb) {
        return {((rgb >> 16) & 255) / 255.0, ((rgb >> 8) & 255) / 255.0, (rgb & 255) / 255.0, 1};
    }
    constexpr Color withAlpha(double value) const { return {red, green, blue, value}; }
    bool operator==(const Color&) const = default;

    static const Color white;
    static const Color black;
    static const Color clear;
};

inline constexpr Color Color::white = Color::gray(1);
inline constexpr Color Color::black = Color::gray(0);
inline constexpr Color Color::clear = Color::gray(0, 0);

} // namespace platform
