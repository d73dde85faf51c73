#pragma once

#include "platform/base/Result.h"
#include "platform/cloud/StoreView.h"

namespace platform {

/// An external document reference is a symbolic link of the store that leads out of the container
/// in which it lies. One that leads nowhere counts by where it points.
bool leavesContainer(const StoreView& view, const Url& link);

/// What the link stands for in the end: an item that is there, or a document that is promised.
/// noSuchItem for a dangling link; an error for links that lead in a circle.
Result<Url> resolveReference(const StoreView& view, const Url& link);

} // namespace platform
