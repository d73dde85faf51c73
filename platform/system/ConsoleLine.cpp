#include "platform/system/JotService.h"

#include <array>
#include <cerrno>
#include <cstdio>
#include <ctime>
#include <unistd.h>

namespace platform {
namespace {

void appendHex(std::string& out, unsigned char byte) {
    static constexpr std::string_view digits = "0123456789ABCDEF";
    out.append("\\x").push_back(digits[byte >> 4]);
    out.push_back(digits[byte & 15]);
}

/// A name may hold line ends and commands of the terminal: they are written so that they can be
/// read, and a message stays one line.
void appendVisibly(std::string& out, std::string_view text) {
    for (std::size_t i = 0; i < text.size(); ++i) {
        const auto byte = static_cast<unsigned char>(text[i]);
        const auto next = static_cast<unsigned char>(i + 1 < text.size() ? text[i + 1] : 0);
        if (byte == '\n') {
            out += "\\n";
        } else if (byte == '\t') {
            out += "\\t";
        } else if (byte < ' ' || byte == 0x7F) {
            appendHex(out, byte);
        } else if (byte == 0xC2 && next >= 0x80 && next < 0xA0) { // U+0080 to U+009F
            appendHex(out, next);
            ++i;
        } else {
            out.push_back(text[i]);
        }
    }
}

} // namespace

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
    appendVisibly(line, text);
    line.push_back('\n');
    // In one piece, so that the lines of several threads do not mix.
    for (std::string_view rest = line; !rest.empty();) {
        const ssize_t put = ::write(STDERR_FILENO, rest.data(), rest.size());
        if (put < 0 && errno != EINTR)
            return;
        rest.remove_prefix(static_cast<std::size_t>(put < 0 ? 0 : put));
    }
}

} // namespace platform
