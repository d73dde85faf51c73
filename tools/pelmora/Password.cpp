#include "tools/pelmora/Password.h"

#include <cstdio>
#include <iostream>
#include <optional>
#include <termios.h>
#include <unistd.h>

namespace pelmora {
namespace {

using namespace platform;

constexpr char interruptKey = '\x03';

/// A terminal that shows nothing of what is typed. Ctrl-C becomes a character, so that nobody is
/// left with a terminal that stays so.
class SilentTerminal {
public:
    SilentTerminal() {
        if (::tcgetattr(STDIN_FILENO, &before_) != 0)
            return;
        termios silent = before_;
        silent.c_lflag &= ~static_cast<tcflag_t>(ECHO | ISIG);
        changed_ = ::tcsetattr(STDIN_FILENO, TCSAFLUSH, &silent) == 0;
    }
    ~SilentTerminal() {
        if (changed_)
            ::tcsetattr(STDIN_FILENO, TCSAFLUSH, &before_);
    }
    SilentTerminal(const SilentTerminal&) = delete;
    SilentTerminal& operator=(const SilentTerminal&) = delete;

private:
    termios before_{};
    bool changed_ = false;
};

void ask(std::string_view question) {
    std::fprintf(stderr, "%s", std::string(question).c_str());
    std::fflush(stderr);
}

} // namespace

Result<std::string> readPassword(std::string_view question) {
    const bool terminal = ::isatty(STDIN_FILENO) == 1;
    std::string line;
    bool got = false;
    if (terminal) {
        ask(question);
        const SilentTerminal silent;
        got = static_cast<bool>(std::getline(std::cin, line));
    } else {
        got = static_cast<bool>(std::getline(std::cin, line));
    }
    if (terminal)
        std::fprintf(stderr, "\n");
    if (!got || line.find(interruptKey) != std::string::npos)
        return makeError(ErrorCode::userCancelled);
    if (!terminal && line.ends_with('\r'))
        line.pop_back();
    return line;
}

bool agrees(std::string_view question) {
    if (::isatty(STDIN_FILENO) != 1)
        return false;
    ask(question);
    std::string line;
    return std::getline(std::cin, line) && (line == "y" || line == "Y" || line == "yes");
}

} // namespace pelmora
