#pragma once

#include "platform/base/Clock.h"
#include "platform/base/Result.h"
#include "platform/cloud/StateRecords.h"
#include "platform/files/ContentProvider.h"

#include <cstddef>
#include <functional>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <vector>

namespace platform {

/// One item as a remote shows it.
struct RemoteEntry {
    std::string name;
    ItemKind kind = ItemKind::file;
    std::uint64_t size = 0;
    Date modified;
    std::optional<Date> created;
    /// Changes with every change of the item; equal means the same version.
    std::string etag;
    /// The version is so young that another one of the same etag could follow it. A remote whose
    /// etags are never shared says no; one that says yes gives the version another etag once it is
    /// old enough.
    bool young = false;
    /// The same for the item's whole life, wherever it moves; "" when the remote has none.
    std::string remoteId;
    SharedRole role = SharedRole::none;
    /// As in the attribute user.xdg.tags.
    std::string tags;
};

/// A folder as it was at one moment. There is none of a part of a folder.
struct RemoteListing {
    std::vector<RemoteEntry> entries;
    /// What lies there and cannot be an item of a store, with the reason.
    std::vector<RefusedRow> refused;
};

/// What a change of a remote is bound to. A remote that cannot check it itself makes the change in
/// steps that lose nothing, and checks what it displaced; see docs/store.md.
struct RemoteCondition {
    /// The version that must stand at the path; none asks that the name is free.
    std::optional<std::string> etag;
    static RemoteCondition nameFree() { return {}; }
    static RemoteCondition version(std::string etag) { return {std::move(etag)}; }
};

/// A content that goes up: where its bytes come from, and what belongs to it.
struct RemoteUpload {
    std::uint64_t size = 0;
    Date modified;
    /// As in the attribute user.xdg.tags.
    std::string tags;
    /// Fills the buffer from `offset` and answers how many bytes it took; 0 is the end. An error
    /// (changedWhileRead above all) ends the upload, and nothing of it may be seen at the path.
    std::function<Result<std::size_t>(std::uint64_t offset, std::span<std::byte> buffer)> read;
};

/// The far side of an account: a tree of folders and files that others change as well. Paths are
/// relative to its root, without a leading slash ("" is the root). Calls block and may come from
/// several threads at once; each can be cancelled (userCancelled).
///
/// serverNotAvailable means that nothing is known: the remote is away, or is not the one that it
/// was. noSuchItem means that the remote is there, and the item is not.
class Remote {
public:
    virtual ~Remote() = default;

    /// Takes the piece of a content that follows; an error ends the transfer with that error.
    using Sink = std::function<Failure(std::span<const std::byte> piece)>;

    /// Proves that it is there. Answers what tells it from every other remote.
    virtual Result<std::string> connect(CancelFlag& cancel) = 0;
    virtual Result<RemoteListing> list(const std::string& path, CancelFlag& cancel) = 0;
    virtual Result<RemoteEntry> entry(const std::string& path, CancelFlag& cancel) = 0;
    /// Hands the content over and answers the version that it was, as a whole; changedWhileRead
    /// when it did not stay the same, and then the pieces are worth nothing.
    virtual Result<RemoteEntry> read(const std::string& path, const Sink& sink,
                                     CancelFlag& cancel) = 0;
    /// Changes. Each is whole or not at all as seen by others, and answers the item read back after
    /// it. An error leaves open whether the change was applied, unless it is one of: fileExists
    /// (the name is taken), changedRemotely (the condition did not hold), noSuchItem,
    /// writeNoPermission, nameRefused, quotaExceeded, outOfSpace, readOnlyVolume; these say that it
    /// was not.
    virtual Result<RemoteEntry> write(const std::string& path, const RemoteUpload& upload,
                                      const RemoteCondition& condition, CancelFlag& cancel) = 0;
    virtual Result<RemoteEntry> makeFolder(const std::string& path, CancelFlag& cancel) = 0;
    /// Never replaces. `etag` is the version to move ("" for any, and for folders).
    virtual Result<RemoteEntry> move(const std::string& from, const std::string& to,
                                     const std::string& etag, CancelFlag& cancel) = 0;
    /// Takes the item out of the tree, recoverably for a time. A file only in the given version; a
    /// folder only when it is empty (folderNotEmpty otherwise).
    [[nodiscard]] virtual Failure remove(const std::string& path, ItemKind kind,
                                         const std::string& etag, CancelFlag& cancel) = 0;
    /// What was answered so far survives a loss of power of the far side, as far as that can be
    /// asked for. Asked once for many changes, before they count as agreed on.
    [[nodiscard]] virtual Failure sync(CancelFlag& cancel) = 0;
    /// Bytes that may still be stored; none where the remote does not tell.
    virtual Result<std::optional<std::uint64_t>> freeBytes(CancelFlag& cancel) = 0;
    /// The directory of this machine that holds the items, where the kernel's notices tell of every
    /// change in it, whoever makes it; none where changes are found by asking alone.
    virtual std::optional<std::string> watchableFolder() const { return std::nullopt; }
};

struct AccountRecord;
/// Makes the remote of an account; empty for a kind that this version does not know. Does not
/// touch the remote: that is for connect(). See StandardRemotes.h.
using RemoteFactory = std::function<std::unique_ptr<Remote>(const AccountRecord& account)>;

/// Files and folders of a remote that serve the store and are no items of it.
inline constexpr std::string_view remoteServiceFolder = ".pelmora";

} // namespace platform
