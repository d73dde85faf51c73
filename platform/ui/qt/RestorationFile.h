#pragma once

#include "platform/base/Result.h"
#include "platform/base/Value.h"

#include <string>

namespace platform {

/// The values that a screen leaves for its next life, kept in a JSON file of mode 0600 that is
/// replaced whole.
Failure writeRestorationFile(const std::string& path, const Value::Map& values);
/// Empty when there is no such file or it cannot be understood.
Value::Map readRestorationFile(const std::string& path);

} // namespace platform
