#pragma once

#include "platform/base/Folders.h"
#include "platform/base/Result.h"
#include "platform/files/FileDescriptor.h"

#include <string>

namespace platform {

/// The folder of the running instance: the lock that makes it the only one, and the socket on which
/// it listens. It is the user's own, and nobody else may enter it.
class InstanceFolder {
public:
    /// In the runtime folder, or in the state folder where there is no runtime folder or it is not
    /// as it must be. Made when it is missing.
    static Result<InstanceFolder> open(const Folders& folders);

    /// The lock, held until the descriptor is closed; empty while another process holds it.
    Result<FileDescriptor> tryLock() const;
    /// A socket on which others may connect, in place of one that a dead instance left.
    Result<FileDescriptor> listen() const;
    /// A connection to whoever listens, not blocking; none, with errno, when nobody does.
    FileDescriptor connect() const;
    void removeSocket() const;
    const std::string& path() const { return path_; }

private:
    InstanceFolder(std::string path, FileDescriptor folder)
        : path_(std::move(path)), folder_(std::move(folder)) {}
    static Result<InstanceFolder> openAt(const std::string& path);

    std::string path_;
    FileDescriptor folder_;
};

} // namespace platform
