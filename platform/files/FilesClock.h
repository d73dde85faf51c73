#pragma once

#include "platform/base/Clock.h"

namespace platform {

/// The installed clock; before there is one, the machine's. Not to be kept: ask anew each time.
Clock& filesClock();

} // namespace platform
