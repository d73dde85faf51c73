#include "platform/system/PeerProcess.h"

#include <array>
#include <climits>
#include <csignal>
#include <poll.h>
#include <sys/socket.h>
#include <sys/syscall.h>

namespace platform {
namespace {

/// Since Linux 6.5; the headers of this system are older.
constexpr int socketPeerHandle = 77;

/// The handle by number is right as long as the process of that number has not ended before.
FileDescriptor handleByNumber(pid_t pid) {
    return FileDescriptor(static_cast<int>(::syscall(SYS_pidfd_open, pid, 0)));
}

} // namespace

std::optional<PeerProcess> PeerProcess::ofSocket(int socket) {
    ucred credentials{};
    socklen_t length = sizeof credentials;
    if (::getsockopt(socket, SOL_SOCKET, SO_PEERCRED, &credentials, &length) != 0)
        return std::nullopt;
    int handle = -1;
    length = sizeof handle;
    if (::getsockopt(socket, SOL_SOCKET, socketPeerHandle, &handle, &length) != 0)
        handle = -1;
    return PeerProcess(credentials.pid, credentials.uid, FileDescriptor(handle));
}

PeerProcess::PeerProcess(pid_t pid, uid_t user, FileDescriptor handle)
    : pid_(pid), user_(user), handle_(std::move(handle)) {
    if (!handle_ && pid_ > 0)
        handle_ = handleByNumber(pid_);
}

bool PeerProcess::isAlive() const {
    if (pid_ <= 0) // of another world of processes
        return false;
    if (!handle_)
        return ::kill(pid_, 0) == 0;
    pollfd ended{handle_.get(), POLLIN, 0};
    return ::poll(&ended, 1, 0) == 0;
}

std::optional<PeerProcess::Executable> PeerProcess::executable() const {
    const std::string link = "/proc/" + std::to_string(pid_) + "/exe";
    std::array<char, PATH_MAX> path{};
    Executable found;
    if (!isAlive())
        return std::nullopt;
    const ssize_t length = ::readlink(link.c_str(), path.data(), path.size());
    if (length <= 0 || ::stat(link.c_str(), &found.file) != 0 || !isAlive())
        return std::nullopt;
    found.path.assign(path.data(), static_cast<std::size_t>(length));
    return found;
}

} // namespace platform
