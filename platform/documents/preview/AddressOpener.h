#pragma once

#include <string>

namespace platform {

/// Opens an address of the web, or a mail to be written, in the application that the user has for
/// it, and nothing else. What goes wrong is shown to the user. Main thread.
void openAddress(const std::string& address);

} // namespace platform
