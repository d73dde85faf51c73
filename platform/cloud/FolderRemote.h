#pragma once

#include "platform/cloud/Remote.h"
#include "platform/files/FileManager.h"

#include <mutex>

namespace platform {

/// A remote that is a directory: of this disk, of another one, or of a network mount. Versions are
/// told by size, times, inode and birth time; tags and the shared role lie in the extended
/// attributes user.xdg.tags and user.pelmora.shared ("owner", "participant").
class FolderRemote final : public Remote {
public:
    explicit FolderRemote(std::string root) : root_(std::move(root)) {}

    /// Makes the root's mark where there is none and the folder may be written to. Without a mark
    /// the folder's own identity tells it from others.
    Result<std::string> connect(CancelFlag& cancel) override;
    Result<RemoteListing> list(const std::string& path, CancelFlag& cancel) override;
    Result<RemoteEntry> entry(const std::string& path, CancelFlag& cancel) override;
    Result<RemoteEntry> read(const std::string& path, const Sink& sink,
                             CancelFlag& cancel) override;
    Result<std::optional<std::uint64_t>> freeBytes(CancelFlag& cancel) override;

private:
    Error away() const;
    /// The folder that connect() saw still stands at the address.
    Failure checkRoot() const;
    /// Tells an item that is gone from a remote that is.
    Error translated(const Error& error) const;
    std::string pathOf(const std::string& path) const;
    Result<RemoteListing> listOnce(const std::string& folder, bool isRoot, CancelFlag& cancel);
    /// None for what cannot be an item; `reason` then says why.
    std::optional<RemoteEntry> entryOf(const std::string& path, std::string_view name,
                                       const FileAttributes& attributes, std::string& reason) const;

    std::string root_;
    mutable std::mutex mutex_;
    FileIdentity identity_; // of the connected root; guarded by mutex_
};

} // namespace platform
