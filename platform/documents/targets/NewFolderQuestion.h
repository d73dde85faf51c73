#pragma once

#include "platform/base/Url.h"

#include <functional>

namespace platform {

class ViewController;

/// Asks over `screen` for the name of a new folder in `folder` and makes it. A name that cannot be
/// leaves the question open and says why. `made` is called with the new folder's URL once the
/// question has gone, not at all when it was cancelled.
void askForNewFolder(ViewController& screen, const Url& folder,
                     std::function<void(const Url& folder)> made);

} // namespace platform
