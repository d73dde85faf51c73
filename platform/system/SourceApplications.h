#pragma once

#include <string_view>

namespace platform {

/// The program that stands for the desk itself: the opener which the desktop entry starts.
inline constexpr std::string_view homeScreenApplicationIdentifier = "com.pelmora.HomeScreen";
/// The runner of user-interface tests.
inline constexpr std::string_view testRunnerApplicationIdentifier = "com.pelmora.UITestRunner";

} // namespace platform
