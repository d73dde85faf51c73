#include "platform/system/ProgramStart.h"

#include "platform/files/PathText.h"

#include <cerrno>
#include <csignal>
#include <fcntl.h>
#include <spawn.h>
#include <string_view>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

namespace platform {
namespace {

std::vector<char*> pointersTo(std::vector<std::string>& texts) {
    std::vector<char*> out;
    out.reserve(texts.size() + 1);
    for (std::string& text : texts)
        out.push_back(text.data());
    out.push_back(nullptr);
    return out;
}

std::vector<std::string> environmentOf(const ProgramStart& start) {
    std::vector<std::string> out;
    for (char** each = environ; each && *each; ++each) {
        const std::string_view entry = *each;
        const std::string_view name = entry.substr(0, entry.find('='));
        bool replaced = false;
        for (const auto& own : start.environment)
            replaced = replaced || own.first == name;
        if (!replaced)
            out.emplace_back(entry);
    }
    for (const auto& [name, value] : start.environment)
        out.push_back(name + '=' + value);
    return out;
}

/// What a new program is to find, as posix_spawn wants it.
class SpawnSetup {
public:
    explicit SpawnSetup(const ProgramStart& start) {
        ::posix_spawn_file_actions_init(&files);
        ::posix_spawnattr_init(&attributes);
        const bool there = ::access(PathText(start.folder).c_str(), X_OK) == 0;
        ::posix_spawn_file_actions_addchdir_np(&files, there ? start.folder.c_str() : "/");
        if (start.output >= 0)
            ::posix_spawn_file_actions_adddup2(&files, start.output, 1);
        if (start.input >= 0)
            ::posix_spawn_file_actions_adddup2(&files, start.input, 0);
        else
            ::posix_spawn_file_actions_addopen(&files, 0, "/dev/null", O_RDONLY, 0);
        sigset_t none;
        sigset_t all;
        ::sigemptyset(&none);
        ::sigfillset(&all);
        ::posix_spawnattr_setsigmask(&attributes, &none);
        ::posix_spawnattr_setsigdefault(&attributes, &all);
        ::posix_spawnattr_setflags(&attributes,
                                   static_cast<short>(POSIX_SPAWN_SETSID | POSIX_SPAWN_SETSIGMASK |
                                                      POSIX_SPAWN_SETSIGDEF));
    }
    ~SpawnSetup() {
        ::posix_spawn_file_actions_destroy(&files);
        ::posix_spawnattr_destroy(&attributes);
    }
    SpawnSetup(const SpawnSetup&) = delete;
    SpawnSetup& operator=(const SpawnSetup&) = delete;

    posix_spawn_file_actions_t files{};
    posix_spawnattr_t attributes{};
};

} // namespace

int StartedProgram::wait() const {
    int status = 0;
    while (::waitpid(pid, &status, 0) < 0)
        if (errno != EINTR)
            return -1;
    return WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
}

Result<StartedProgram> startProgram(const ProgramStart& start) {
    std::vector<std::string> arguments = start.arguments;
    std::vector<std::string> environment = environmentOf(start);
    const SpawnSetup setup(start);
    StartedProgram started;
    const int number =
        ::posix_spawnp(&started.pid, arguments.front().c_str(), &setup.files, &setup.attributes,
                       pointersTo(arguments).data(), pointersTo(environment).data());
    if (number != 0)
        return posixError(number, Url::file(arguments.front()), false);
    started.handle = FileDescriptor(static_cast<int>(::syscall(SYS_pidfd_open, started.pid, 0)));
    return started;
}

} // namespace platform
