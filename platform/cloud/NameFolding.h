#pragma once

#include <string>
#include <string_view>

namespace platform {

/// The name as a search and a check for twins see it: composed characters, no letter case. Bytes
/// that are not UTF-8 become replacement characters.
std::string foldedName(std::string_view name);

/// Whether the bytes are well-formed UTF-8.
bool isUtf8(std::string_view text);

} // namespace platform
