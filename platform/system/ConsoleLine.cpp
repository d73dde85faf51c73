#include "platform/system/JotService.h"

#include <array>
#include <cerrno>
#include <cstdio>
#include <ctime>
#include <unistd.h>

namespace platform {

void writeConsoleLine(std::string_view text) {
    timespec now{};
    ::clock_gettime(CLOCK_REALTIME, &now);
    tm local{};
    ::localtime_r(&now.tv_sec, &local);
    std::array<char, 32> time{};
    std::strftime(time.data(), time.size(), "%Y-%m-%d %H:%M:%S", &local);
    std::array<char, 96> head{};
    std::snprintf(head.data(), head.size(), "%s.%03d %.32s[%d]: ", time.data(),
                  static_cast<int>(now.tv_nsec / 1'000'000), program_invocation_short_name,
                  static_cast<int>(::getpid()));
    std::string line = head.data();
    line.append(text).push_back('\n');
    // In one piece, so that the lines of several threads do not mix.
    for (std::string_view rest = line; !rest.empty();) {
        const ssize_t put = ::write(STDERR_FILENO, rest.data(), rest.size());
        if (put < 0 && errno != EINTR)
            return;
        rest.remove_prefix(static_cast<std::size_t>(put < 0 ? 0 : put));
    }
}

} // namespace platform
