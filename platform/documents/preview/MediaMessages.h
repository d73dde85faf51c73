#pragma once

#include <cstdint>

namespace platform {

/// What the preview and the player, a process of its own, tell each other through a socket: a head,
/// and for some kinds bytes behind it. Both are built together and run on one machine.
struct MediaHead {
    std::uint32_t kind = 0;
    /// Bytes behind the head.
    std::uint32_t length = 0;
    /// By the kind.
    std::int64_t value = 0;
};

/// To the player.
enum class MediaWish : std::uint32_t {
    play = 1,
    pause,
    /// To that millisecond.
    seek,
    /// Of 1000.
    volume,
    /// 1 or 0.
    mute,
    /// Pictures need not be larger: width << 32 | height, in pixels.
    size,
    /// The last picture was taken: there may be another.
    taken,
};

/// From the player.
enum class MediaEvent : std::uint32_t {
    /// What there is is known; MediaTrait bits.
    ready = 1,
    /// In milliseconds.
    duration,
    position,
    /// 1 while it plays.
    playing,
    /// It has come to its end.
    ended,
    /// A text behind it.
    title,
    artist,
    /// Pixels of 32 bits behind it, red, green and blue from the high end; width << 32 | height.
    picture,
    cover,
    /// It cannot be played; a text of the decoder's behind it.
    failed,
    /// There is nothing here to play anything with.
    unavailable,
};

namespace mediaTrait {
inline constexpr std::int64_t video = 1;
inline constexpr std::int64_t audio = 2;
/// There is a device to hear it from.
inline constexpr std::int64_t soundDevice = 4;
inline constexpr std::int64_t seekable = 8;
} // namespace mediaTrait

/// No picture is larger: a screen of that size is filled, and one takes 8 MB.
inline constexpr std::int64_t mostPictureWidth = 1920;
inline constexpr std::int64_t mostPictureHeight = 1200;
inline constexpr std::uint32_t longestMediaText = 1000;
inline constexpr std::uint32_t longestMediaBytes =
    static_cast<std::uint32_t>(mostPictureWidth * mostPictureHeight * 4);

constexpr std::int64_t packedSize(std::int64_t width, std::int64_t height) {
    return (width << 32) | height;
}
constexpr std::int64_t packedWidth(std::int64_t size) {
    return size >> 32;
}
constexpr std::int64_t packedHeight(std::int64_t size) {
    return size & 0xFFFFFFFF;
}

} // namespace platform
