#pragma once

#include "platform/base/Url.h"

#include <string>

namespace platform {

/// Puts the file on the clipboard, so that file managers and mail programs paste it; whoever wants
/// text gets its path. Main thread.
void copyDocument(const Url& document);
void copyText(const std::string& text);

} // namespace platform
