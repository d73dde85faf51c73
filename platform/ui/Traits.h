#pragma once

namespace platform {

enum class DeviceIdiom { phone, tablet };
/// The values are those of the interface that screens ask by.
enum class SizeClass { unspecified = 0, compact = 1, regular = 2 };
enum class Orientation {
    unknown = 0,
    portrait = 1,
    portraitUpsideDown = 2,
    landscapeLeft = 3,
    landscapeRight = 4
};

struct TraitCollection {
    SizeClass horizontal = SizeClass::unspecified;
    SizeClass vertical = SizeClass::unspecified;
    bool operator==(const TraitCollection&) const = default;
};

/// Size classes of a window, in points: a side is compact below 600 (horizontal) and below 480
/// (vertical), else regular.
constexpr TraitCollection traitsForSize(double width, double height) {
    return {width < 600 ? SizeClass::compact : SizeClass::regular,
            height < 480 ? SizeClass::compact : SizeClass::regular};
}

constexpr Orientation orientationForSize(double width, double height) {
    return width > height ? Orientation::landscapeLeft : Orientation::portrait;
}

} // namespace platform
