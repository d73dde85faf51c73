#pragma once

#include <algorithm>
#include <string_view>

namespace platform {

/// The scheme of the addresses that the desk brings to this application.
inline constexpr std::string_view urlScheme = "tavrinapp";

/// Whether a text is an address of that scheme, in any letter case: the desk makes no difference,
/// and which spelling is the right one the application decides.
inline bool hasUrlScheme(std::string_view text) {
    const auto isSame = [](char wanted, char found) {
        return wanted ==
               (found >= 'A' && found <= 'Z' ? static_cast<char>(found + ('a' - 'A')) : found);
    };
    return text.size() > urlScheme.size() && text[urlScheme.size()] == ':' &&
           std::equal(urlScheme.begin(), urlScheme.end(), text.begin(), isSame);
}

} // namespace platform
