#pragma once

#include <string_view>

namespace platform {

/// The application's identifier: the prefix of its preference keys and queue labels, the facility
/// of its log records, its bus name and the name of its desktop entry and data folder.
inline constexpr std::string_view applicationIdentifier = "com.pelmora.Tavrin";
/// The same in lower case, as the logging queue's label wants it.
inline constexpr std::string_view applicationIdentifierLowercase = "com.pelmora.tavrin";
/// The program's name as its window and its icon show it.
inline constexpr std::string_view applicationName = "Tavrin";

} // namespace platform
