#include "platform/base/Process.h"

#include <array>
#include <cstdlib>
#include <unistd.h>

namespace platform {

std::uint64_t processIdentifier() {
    return static_cast<std::uint64_t>(getpid());
}

std::optional<std::string> hostName() {
    std::array<char, 256> buffer{};
    if (gethostname(buffer.data(), buffer.size() - 1) != 0)
        return std::nullopt;
    return std::string(buffer.data());
}

void setEnvironmentVariable(const std::string& name, const std::optional<std::string>& value) {
    if (value)
        setenv(name.c_str(), value->c_str(), 1);
    else
        unsetenv(name.c_str());
}

std::optional<std::string> environmentVariable(const std::string& name) {
    const char* value = std::getenv(name.c_str());
    return value ? std::optional<std::string>(value) : std::nullopt;
}

} // namespace platform
