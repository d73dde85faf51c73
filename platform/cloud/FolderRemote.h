#pragma once

#include "platform/cloud/Remote.h"
#include "platform/cloud/RemoteTrash.h"
#include "platform/files/FileManager.h"

#include <mutex>

namespace platform {

/// A remote that is a directory: of this disk, of another one, or of a network mount. Versions are
/// told by size, times, inode and birth time; tags and the shared role lie in the extended
/// attributes user.xdg.tags and user.pelmora.shared ("owner", "participant"). Other programs change
/// the directory at the same time: a change displaces what it replaces into the hidden trash, looks
/// at what that was, and puts back what it was not made for.
class FolderRemote final : public Remote {
public:
    FolderRemote(std::string root, Clock& clock);

    /// Makes the root's mark where there is none and the folder may be written to. Without a mark
    /// the folder's own identity tells it from others.
    Result<std::string> connect(CancelFlag& cancel) override;
    Result<RemoteListing> list(const std::string& path, CancelFlag& cancel) override;
    Result<RemoteEntry> entry(const std::string& path, CancelFlag& cancel) override;
    Result<RemoteEntry> read(const std::string& path, const Sink& sink,
                             CancelFlag& cancel) override;
    Result<RemoteEntry> write(const std::string& path, const RemoteUpload& upload,
                              const RemoteCondition& condition, CancelFlag& cancel) override;
    Result<RemoteEntry> makeFolder(const std::string& path, CancelFlag& cancel) override;
    Result<RemoteEntry> move(const std::string& from, const std::string& to,
                             const std::string& etag, CancelFlag& cancel) override;
    [[nodiscard]] Failure remove(const std::string& path, ItemKind kind, const std::string& etag,
                                 CancelFlag& cancel) override;
    [[nodiscard]] Failure sync(CancelFlag& cancel) override;
    Result<std::optional<std::uint64_t>> freeBytes(CancelFlag& cancel) override;
    /// None on a network mount, whose other users the kernel does not hear of.
    std::optional<std::string> watchableFolder() const override;

private:
    /// Contents go either way in pieces of so many bytes.
    static constexpr std::size_t pieceSize = std::size_t{1024} * 1024;
    struct Upload;
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

    std::string versionOf(const FileAttributes& attributes) const;

    /// The item at the path may be changed: its name is one that the remote takes, and the folders
    /// above it are folders of this remote.
    Failure checkChange(const std::string& path, CancelFlag& cancel) const;
    /// The same for a file that must stand there in that version.
    Result<FileAttributes> checkVersion(const std::string& path, const std::string& etag) const;
    /// What stands at the path after a change; `expected` is what the change put there.
    Result<RemoteEntry> readBack(const std::string& path, const FileAttributes& expected) const;
    Failure fill(Upload& upload, const RemoteUpload& content, CancelFlag& cancel) const;
    Failure replace(Upload& upload, const std::string& path, const std::string& etag) const;
    Failure replaceInSteps(Upload& upload, const std::string& path,
                           const FileAttributes& before) const;
    /// Gives what was displaced by mistake its name again, or one beside it.
    Failure putBack(const std::string& from, const std::string& path) const;
    /// The remote's own words for an error of the disk.
    Error refused(const Error& error, const std::string& path) const;

    std::string root_;
    Clock& clock_;
    RemoteTrash trash_;
    mutable std::mutex mutex_;
    FileIdentity identity_; // of the connected root; guarded by mutex_
};

} // namespace platform
