#pragma once

#include "platform/files/FileDescriptor.h"

#include <optional>
#include <string>
#include <sys/stat.h>
#include <sys/types.h>

namespace platform {

/// The process at the other end of a connection, as the system knows it. Where the system hands out
/// a handle of the process, a process number that was given away again deceives nobody.
class PeerProcess {
public:
    /// Of a connected local socket; none when the system does not say.
    static std::optional<PeerProcess> ofSocket(int socket);
    /// Of a number and, where there is one, the handle that came with it.
    PeerProcess(pid_t pid, uid_t user, FileDescriptor handle);

    uid_t user() const { return user_; }
    pid_t pid() const { return pid_; }
    /// False once it has ended.
    bool isAlive() const;

    struct Executable {
        std::string path;
        struct stat file {};
    };
    /// The file that it runs; none when it has ended or may not be looked at.
    std::optional<Executable> executable() const;

private:
    pid_t pid_ = 0;
    uid_t user_ = 0;
    FileDescriptor handle_;
};

} // namespace platform
