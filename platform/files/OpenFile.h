#pragma once

#include "platform/files/FileManager.h"

namespace platform {

/// Of the file that a descriptor stands for, whatever happens to its name meanwhile; `path` is for
/// the error. For sources below the line.
Result<FileAttributes> attributesOfOpen(int file, std::string_view path);

} // namespace platform
