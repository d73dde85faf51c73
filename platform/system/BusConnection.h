#pragma once

#include "platform/base/Clock.h"
#include "platform/system/SystemHandles.h"

#include <string>
#include <string_view>

namespace platform {

inline constexpr const char* applicationInterface = "org.freedesktop.Application";

/// A connection to the bus at that address; empty when there is none. Whoever does not answer
/// within `patience` counts as failed.
Bus connectToBus(const std::string& address, Duration patience);
/// Where the environment says the session bus is; "" when it does not.
std::string sessionBusAddress();
/// The path at which an application of that identifier answers on the bus.
std::string busPathOf(std::string_view applicationIdentifier);

} // namespace platform
