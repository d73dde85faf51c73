#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace platform {

/// The values are those by which callers of the formatter know the styles.
enum class ByteCountStyle {
    /// 1000 bytes to the kilobyte, as file sizes are written.
    file = 0,
    /// 1024 bytes to the kilobyte.
    binary = 3,
};

/// A byte count for people in the user's language: "1 byte", "812 KB", "6.3 MB", "1.5 GB". Bytes
/// and kilobytes are whole, megabytes have at most one decimal, larger units at most two; trailing
/// zeros go. Without the unit the number alone is written.
std::string byteCountText(std::uint64_t bytes, ByteCountStyle style, bool withUnit = true);

/// Reads a number written in the user's locale; 0 when it is none.
double localizedNumberValue(std::string_view text);
/// Writes a number in the user's locale, with at most `decimals` decimals and no trailing zeros.
std::string localizedNumberText(double number, int decimals);

} // namespace platform
