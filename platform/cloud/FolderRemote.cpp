#include "platform/cloud/FolderRemote.h"

#include "platform/base/Text.h"
#include "platform/cloud/FolderVersion.h"
#include "platform/cloud/SyncTimes.h"
#include "platform/cloud/Tokens.h"
#include "platform/files/FileDescriptor.h"
#include "platform/files/OpenFile.h"

#include <cerrno>
#include <fcntl.h>
#include <sys/xattr.h>
#include <unistd.h>

namespace platform {
namespace {

/// A folder that others change all the time is read again this often before it is left for later.
constexpr int listingTries = 3;
constexpr std::uint64_t largestMark = 256;
constexpr const char* sharedAttribute = "user.pelmora.shared";

bool sameFolderState(const FileAttributes& a, const FileAttributes& b) {
    return a.identity == b.identity && a.modified == b.modified && a.changed == b.changed;
}

SharedRole roleOf(const std::optional<std::string>& text) {
    if (text == "owner")
        return SharedRole::owner;
    return text == "participant" ? SharedRole::participant : SharedRole::none;
}

bool meansAway(const Error& error) {
    return error.is(ErrorCode::timedOut) || error.is(ErrorCode::serverNotAvailable);
}

} // namespace

FolderRemote::FolderRemote(std::string root, Clock& clock)
    : root_(std::move(root)),
      clock_(clock),
      trash_(root_ + '/' + std::string(remoteServiceFolder), clock) {
}

std::string FolderRemote::versionOf(const FileAttributes& attributes) const {
    return versionText(attributes, clock_.now());
}

Error FolderRemote::away() const {
    return makeErrorWithText(
        ErrorCode::serverNotAvailable,
        localizedFormat("The folder “%1$@” of your Pelmora account is not there. Connect its disk, "
                        "or sign in again if it has moved.",
                        root_));
}

std::string FolderRemote::pathOf(const std::string& path) const {
    return path.empty() ? root_ : root_ + '/' + path;
}

Failure FolderRemote::checkRoot() const {
    const Result<FileAttributes> root = FileManager::attributes(root_, FollowLinks::yes);
    const std::lock_guard lock(mutex_);
    if (!root || root->kind != FileKind::directory || root->identity != identity_)
        return away();
    return std::nullopt;
}

Error FolderRemote::translated(const Error& error) const {
    if (meansAway(error))
        return away();
    return checkRoot().value_or(error);
}

Result<std::string> FolderRemote::connect(CancelFlag& cancel) {
    if (cancel.isCancelled())
        return makeError(ErrorCode::userCancelled);
    const Result<FileAttributes> root = FileManager::attributes(root_, FollowLinks::yes);
    if (!root || root->kind != FileKind::directory)
        return away();
    const std::string folder = root_ + '/' + std::string(remoteServiceFolder);
    const Url markFile = Url::file(folder + "/root");
    std::string mark;
    if (const Result<Bytes> content = FileManager::contents(markFile, largestMark)) {
        mark.assign(reinterpret_cast<const char*>(content->data()), content->size());
    } else if (content.error().is(ErrorCode::noSuchItem)) {
        mark = hexText(randomBytes(16));
        if (FileManager::createDirectory(Url::file(folder), true) ||
            FileManager::writeAtomically(markFile, mark))
            mark = "unmarked " + versionOf(*root);
    } else {
        return content.error();
    }
    trash_.expire();
    const std::lock_guard lock(mutex_);
    identity_ = root->identity;
    return mark;
}

Result<RemoteListing> FolderRemote::list(const std::string& path, CancelFlag& cancel) {
    if (Failure failure = checkRoot())
        return *failure;
    for (int attempt = 1;; ++attempt) {
        Result<RemoteListing> listing = listOnce(pathOf(path), path.empty(), cancel);
        if (listing || !listing.error().is(ErrorCode::changedWhileRead) ||
            attempt == listingTries) {
            // A disk that went away in the middle leaves an empty or a cut folder.
            const Failure gone = checkRoot();
            return gone ? Result<RemoteListing>(*gone) : std::move(listing);
        }
    }
}

Result<RemoteListing> FolderRemote::listOnce(const std::string& folder, bool isRoot,
                                             CancelFlag& cancel) {
    const Result<FileAttributes> before = FileManager::attributes(folder, FollowLinks::no);
    if (!before || (before->kind != FileKind::directory && !isRoot))
        return before ? makeError(ErrorCode::noSuchItem, folder) : translated(before.error());
    RemoteListing listing;
    Failure broken;
    const Failure failure = FileManager::enumerate(folder, [&](const DirectoryEntry& found) {
        if (cancel.isCancelled()) {
            broken = makeError(ErrorCode::userCancelled);
            return false;
        }
        if (isRoot && found.name == remoteServiceFolder)
            return true;
        const std::string path = folder + '/' + found.name;
        const Result<FileAttributes> attributes = FileManager::attributes(path, FollowLinks::no);
        if (!attributes) {
            const bool vanished = attributes.error().is(ErrorCode::noSuchItem);
            broken = vanished ? makeError(ErrorCode::changedWhileRead, folder)
                              : translated(attributes.error());
            return false;
        }
        std::string reason;
        if (std::optional<RemoteEntry> entry = entryOf(path, found.name, *attributes, reason))
            listing.entries.push_back(std::move(*entry));
        else
            listing.refused.push_back({found.name, std::move(reason)});
        return true;
    });
    if (broken || failure)
        return broken ? *broken : translated(*failure);
    const Result<FileAttributes> after = FileManager::attributes(folder, FollowLinks::no);
    if (!after || !sameFolderState(*before, *after))
        return makeError(ErrorCode::changedWhileRead, folder);
    return listing;
}

std::optional<RemoteEntry> FolderRemote::entryOf(const std::string& path, std::string_view name,
                                                 const FileAttributes& attributes,
                                                 std::string& reason) const {
    if (attributes.kind == FileKind::symbolicLink)
        reason = localized("It is a symbolic link.");
    else if (attributes.kind == FileKind::other)
        reason = localized("It is neither a file nor a folder.");
    else if (hasSidecarForm(name))
        reason =
            localized("Names that begin with “.” and end in “.promise” are kept for promises.");
    else if (const std::lock_guard lock(mutex_); attributes.identity.device != identity_.device)
        // A disk that is not mounted one day would look like an emptied folder.
        reason = localized("It lies on another disk than the account's folder.");
    if (!reason.empty())
        return std::nullopt;
    RemoteEntry entry;
    entry.name = name;
    entry.kind = attributes.kind == FileKind::directory ? ItemKind::folder : ItemKind::file;
    entry.size = entry.kind == ItemKind::file ? attributes.size : 0;
    entry.modified = attributes.modified;
    if (attributes.identity.birthNanoseconds != 0)
        entry.created = attributes.created;
    const Date now = clock_.now();
    entry.etag = versionText(attributes, now);
    entry.young = entry.kind == ItemKind::file && isYoung(attributes.modified, now);
    entry.remoteId = identityText(attributes);
    if (llistxattr(path.c_str(), nullptr, 0) > 0) { // one call for the many without any
        entry.role = roleOf(extendedAttribute(path, sharedAttribute, FollowLinks::no));
        entry.tags = extendedAttribute(path, "user.xdg.tags", FollowLinks::no).value_or("");
    }
    return entry;
}

Result<RemoteEntry> FolderRemote::entry(const std::string& path, CancelFlag& cancel) {
    if (cancel.isCancelled())
        return makeError(ErrorCode::userCancelled);
    if (Failure failure = checkRoot())
        return *failure;
    const std::string full = pathOf(path);
    const Result<FileAttributes> attributes = FileManager::attributes(full, FollowLinks::no);
    if (!attributes)
        return translated(attributes.error());
    std::string reason;
    std::optional<RemoteEntry> entry =
        entryOf(full, Url::file(full).lastPathComponent(), *attributes, reason);
    if (!entry)
        return makeErrorWithText(ErrorCode::serverRefused, std::move(reason));
    return std::move(*entry);
}

Result<RemoteEntry> FolderRemote::read(const std::string& path, const Sink& sink,
                                       CancelFlag& cancel) {
    const Result<RemoteEntry> before = entry(path, cancel);
    if (!before)
        return before;
    const std::string full = pathOf(path);
    const FileDescriptor file(open(full.c_str(), O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC));
    if (!file)
        return translated(posixError(errno, Url::file(full), false));
    const Error changed = makeError(ErrorCode::changedWhileRead, before->name);
    const Result<FileAttributes> opened = attributesOfOpen(file.get(), full);
    // A version may have grown up since: then the next try sees it so from the start.
    if (!opened || versionOf(*opened) != before->etag || before->kind != ItemKind::file)
        return changed;
    posix_fadvise(file.get(), 0, 0, POSIX_FADV_SEQUENTIAL);
    std::vector<std::byte> piece(std::min<std::uint64_t>(pieceSize, before->size + 1));
    std::uint64_t total = 0;
    for (;;) {
        if (cancel.isCancelled())
            return makeError(ErrorCode::userCancelled);
        const ssize_t got = ::read(file.get(), piece.data(), piece.size());
        if (got < 0 && errno == EINTR)
            continue;
        if (got < 0)
            return translated(posixError(errno, Url::file(full), false));
        if (got == 0)
            break;
        total += static_cast<std::uint64_t>(got);
        if (total > before->size)
            return changed;
        if (Failure failure = sink({piece.data(), static_cast<std::size_t>(got)}))
            return *failure;
    }
    const Result<FileAttributes> after = attributesOfOpen(file.get(), full);
    const Result<FileAttributes> standing = FileManager::attributes(full, FollowLinks::no);
    if (!standing && !standing.error().is(ErrorCode::noSuchItem))
        return translated(standing.error());
    if (total != before->size || !after || !sameVersion(*after, *opened) || !standing ||
        !sameVersion(*standing, *opened))
        return changed;
    return before; // also when it has grown up meanwhile: it was read while it was young
}

Result<std::optional<std::uint64_t>> FolderRemote::freeBytes(CancelFlag& cancel) {
    if (cancel.isCancelled())
        return makeError(ErrorCode::userCancelled);
    if (Failure failure = checkRoot())
        return *failure;
    const Result<std::uint64_t> free = FileManager::freeBytes(root_);
    if (!free)
        return translated(free.error());
    return std::optional(*free);
}

} // namespace platform
