#pragma once

#include <cstdint>
#include <optional>
#include <string>

namespace platform {

/// Of the running process and its machine.
std::uint64_t processIdentifier();
/// At most 255 bytes; none when it cannot be read.
std::optional<std::string> hostName();
/// Sets (overwriting) or, with none, removes a variable of the process's environment. Other threads
/// must not read the environment through the C library at that moment.
void setEnvironmentVariable(const std::string& name, const std::optional<std::string>& value);
std::optional<std::string> environmentVariable(const std::string& name);

} // namespace platform
