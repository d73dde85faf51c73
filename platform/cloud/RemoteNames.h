#pragma once

#include "platform/base/Result.h"

#include <string>
#include <string_view>

// Names that a remote cannot have, whatever kind it is of.

namespace platform {

/// nameRefused, with the reason in the user's language.
Error nameRefusedError(std::string_view name, std::string reason);

/// None when the item of that name may be at that path of a remote.
Failure remoteNameProblem(std::string_view path, std::string_view name);

} // namespace platform
