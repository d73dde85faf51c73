#pragma once

#include "platform/files/FileManager.h"

#include <functional>

namespace platform {

/// Reads the entries of an open folder from its present offset on. Answers 0 or an errno.
int listOpenFolder(int folder, const std::function<bool(const DirectoryEntry&)>& take);

} // namespace platform
