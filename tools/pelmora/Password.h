#pragma once

#include "platform/base/Result.h"

#include <string>
#include <string_view>

namespace pelmora {

/// From the terminal, without showing it; or the first line of standard input where that is none.
/// userCancelled on Ctrl-C or where nothing comes.
platform::Result<std::string> readPassword(std::string_view question);
/// True when a person at the terminal says yes; false where there is no terminal.
bool agrees(std::string_view question);

} // namespace pelmora
