#include "platform/base/Date.h"

#include <array>
#include <ctime>

namespace platform {

void appendDescription(std::string& out, Date date) {
    const std::time_t seconds = date.wholeSeconds();
    std::tm parts{};
    if (gmtime_r(&seconds, &parts) == nullptr) {
        out += std::to_string(date.wholeSeconds());
        return;
    }
    std::array<char, 64> buffer{};
    const std::size_t length =
        std::strftime(buffer.data(), buffer.size(), "%Y-%m-%d %H:%M:%S +0000", &parts);
    out.append(buffer.data(), length);
}

} // namespace platform
