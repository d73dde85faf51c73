#include "platform/system/InstanceFolder.h"

#include "platform/base/Identity.h"
#include "platform/base/Log.h"
#include "platform/base/Process.h"
#include "platform/base/Text.h"
#include "platform/files/FileManager.h"
#include "platform/files/PathText.h"

#include <atomic>
#include <cerrno>
#include <cstdio>
#include <fcntl.h>
#include <sys/file.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>

namespace platform {
namespace {

constexpr const char* lockName = "instance.lock";
constexpr const char* socketName = "instance.socket";
constexpr int waitingConnections = 64;

/// The socket's address by way of the open folder: of any length of path, and no other folder's.
sockaddr_un addressIn(int folder) {
    sockaddr_un address{};
    address.sun_family = AF_UNIX;
    std::snprintf(address.sun_path, sizeof address.sun_path, "/proc/self/fd/%d/%s", folder,
                  socketName);
    return address;
}

FileDescriptor newSocket() {
    return FileDescriptor(::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC | SOCK_NONBLOCK, 0));
}

/// The user's alone, as the rules for that folder want it.
bool isPrivateFolder(const std::string& path) {
    struct stat found {};
    return ::stat(PathText(path).c_str(), &found) == 0 && S_ISDIR(found.st_mode) &&
           found.st_uid == ::geteuid() && (found.st_mode & 0077) == 0;
}

/// Not again and again: whoever waits for an instance looks many times a second.
template<class... Args>
void sayOnce(std::type_identity_t<LogFormat<Args...>> text, const Args&... args) {
    static std::atomic<bool> said{false};
    if (!said.exchange(true))
        platformLog(LogLevel::warning, text, args...);
}

/// Two machines may share a home, and with it the state folder, but no instance.
std::string folderInState(const Folders& folders) {
    return folders.state + "/" + std::string(applicationIdentifierLowercase) + "/instance-" +
           percentEncoded(hostName().value_or(""));
}

} // namespace

Result<InstanceFolder> InstanceFolder::open(const Folders& folders) {
    if (folders.runtime) {
        if (isPrivateFolder(*folders.runtime)) {
            auto found = openAt(*folders.runtime + "/" + std::string(applicationIdentifier));
            if (found)
                return found;
            sayOnce("The runtime folder is of no use: %@", found.error());
        } else {
            sayOnce("%@ is not a folder of the user alone; it is not used for the instance",
                    *folders.runtime);
        }
    }
    return openAt(folderInState(folders));
}

Result<InstanceFolder> InstanceFolder::openAt(const std::string& path) {
    const Url url = Url::file(path, true);
    if (const Failure failure =
            FileManager::createDirectory(*url.deletingLastPathComponent(), true))
        return *failure;
    const PathText text(path);
    if (::mkdir(text.c_str(), 0700) != 0 && errno != EEXIST)
        return posixError(errno, url, true);
    FileDescriptor folder(::open(text.c_str(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC));
    struct stat found {};
    if (!folder || ::fstat(folder.get(), &found) != 0)
        return posixError(errno, url, true);
    // Whoever made it while others could look in made it for this, and it is empty or ours.
    if (found.st_uid != ::geteuid() ||
        ((found.st_mode & 0077) != 0 && ::fchmod(folder.get(), 0700) != 0))
        return makeErrorWithText(
            ErrorCode::writeNoPermission,
            localizedFormat("The folder “%1$@” belongs to somebody else. Remove it, or have it "
                            "removed, and start again.",
                            path));
    return InstanceFolder(path, std::move(folder));
}

Result<FileDescriptor> InstanceFolder::tryLock() const {
    FileDescriptor lock(
        ::openat(folder_.get(), lockName, O_RDWR | O_CREAT | O_NOFOLLOW | O_CLOEXEC, 0600));
    if (lock && ::flock(lock.get(), LOCK_EX | LOCK_NB) == 0)
        return lock;
    if (lock && errno == EWOULDBLOCK)
        return FileDescriptor();
    return posixError(errno, Url::file(path_ + '/' + lockName), true);
}

Result<FileDescriptor> InstanceFolder::listen() const {
    removeSocket();
    FileDescriptor socket = newSocket();
    const sockaddr_un address = addressIn(folder_.get());
    if (!socket ||
        ::bind(socket.get(), reinterpret_cast<const sockaddr*>(&address), sizeof address) != 0 ||
        ::listen(socket.get(), waitingConnections) != 0)
        return posixError(errno, Url::file(path_ + '/' + socketName), true);
    return socket;
}

FileDescriptor InstanceFolder::connect() const {
    FileDescriptor socket = newSocket();
    const sockaddr_un address = addressIn(folder_.get());
    if (socket &&
        ::connect(socket.get(), reinterpret_cast<const sockaddr*>(&address), sizeof address) != 0) {
        const int number = errno;
        socket.reset();
        errno = number;
    }
    return socket;
}

void InstanceFolder::removeSocket() const {
    ::unlinkat(folder_.get(), socketName, 0);
}

} // namespace platform
