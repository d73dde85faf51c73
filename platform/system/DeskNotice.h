#pragma once

#include "platform/base/Error.h"

#include <string>
#include <string_view>

namespace platform {

/// Says why a start came to nothing: "program: text" on standard error and, where no terminal shows
/// that, as a notice of the desk on the session bus of that address. Before there is a window.
void sayStartFailed(std::string_view program, const Error& error, const std::string& busAddress);

} // namespace platform
