#include "tests/support/Program.h"

#include <array>
#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>
#include <utility>

namespace test {
namespace {

std::vector<char*> pointersOf(std::vector<std::string>& texts) {
    std::vector<char*> out;
    out.reserve(texts.size() + 1);
    for (std::string& text : texts)
        out.push_back(text.data());
    out.push_back(nullptr);
    return out;
}

} // namespace

Program::Program(Start start) : group_(start.ownGroup) {
    std::array<int, 2> in{};
    std::array<int, 2> out{};
    if (::pipe2(in.data(), O_CLOEXEC) != 0 || ::pipe2(out.data(), O_CLOEXEC) != 0)
        std::abort();
    posix_spawn_file_actions_t files;
    posix_spawnattr_t attributes;
    ::posix_spawn_file_actions_init(&files);
    ::posix_spawnattr_init(&attributes);
    ::posix_spawn_file_actions_adddup2(&files, in[0], 0);
    ::posix_spawn_file_actions_adddup2(&files, out[1], 1);
    if (group_)
        ::posix_spawnattr_setflags(&attributes, POSIX_SPAWN_SETPGROUP);
    std::vector<char*> arguments = pointersOf(start.arguments);
    std::vector<char*> environment;
    if (start.environment)
        environment = pointersOf(*start.environment);
    if (::posix_spawnp(&pid_, arguments.front(), &files, &attributes, arguments.data(),
                       start.environment ? environment.data() : environ) != 0) {
        pid_ = -1;
        status_ = 127;
    }
    ::posix_spawn_file_actions_destroy(&files);
    ::posix_spawnattr_destroy(&attributes);
    ::close(in[0]);
    ::close(out[1]);
    input_ = in[1];
    output_ = out[0];
}

Program::~Program() {
    if (!status_) {
        kill(SIGKILL);
        wait();
    }
    closeInput();
    ::close(output_);
}

std::optional<std::string> Program::readLine() {
    for (;;) {
        if (const std::size_t end = unread_.find('\n'); end != std::string::npos) {
            std::string line = unread_.substr(0, end);
            unread_.erase(0, end + 1);
            return line;
        }
        std::array<char, 4096> buffer{};
        const ssize_t got = ::read(output_, buffer.data(), buffer.size());
        if (got < 0 && errno == EINTR)
            continue;
        if (got <= 0)
            return std::nullopt;
        unread_.append(buffer.data(), static_cast<std::size_t>(got));
    }
}

std::string Program::readAll() {
    std::string out;
    while (const auto line = readLine())
        out += *line + '\n';
    return out + std::exchange(unread_, {});
}

void Program::writeLine(const std::string& line) const {
    const std::string text = line + '\n';
    if (::write(input_, text.data(), text.size()) != static_cast<ssize_t>(text.size()))
        std::abort();
}

void Program::closeInput() {
    if (input_ >= 0)
        ::close(std::exchange(input_, -1));
}

void Program::kill(int signal) const {
    if (pid_ > 0 && !status_)
        ::kill(group_ ? -pid_ : pid_, signal);
}

void Program::stop() const {
    kill(SIGSTOP);
    siginfo_t stopped{};
    while (pid_ > 0 && !status_ &&
           ::waitid(P_PID, static_cast<id_t>(pid_), &stopped, WSTOPPED | WEXITED | WNOWAIT) != 0 &&
           errno == EINTR)
        ;
}

int Program::wait() {
    int status = 0;
    while (!status_ && (::waitpid(pid_, &status, 0) == pid_ || errno != EINTR))
        status_ = WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
    return status_.value_or(-1);
}

Outcome run(Program::Start start) {
    Program program(std::move(start));
    program.closeInput();
    Outcome outcome;
    outcome.output = program.readAll();
    outcome.status = program.wait();
    return outcome;
}

} // namespace test
