#pragma once

#include "platform/base/Result.h"

namespace platform {

/// What a symbolic link points at, through further links; the item itself when it is none. The
/// target need not exist: it may be a promise.
Result<Url> resolvingSymbolicLinks(const Url& item);

} // namespace platform
