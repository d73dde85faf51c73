#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/cloud/FolderRemote.h"
#include "platform/cloud/FolderVersion.h"
#include "platform/cloud/RemoteNames.h"
#include "platform/cloud/StoreContext.h"
#include "platform/cloud/SyncNames.h"
#include "platform/files/PathText.h"

#include <cerrno>
#include <fcntl.h>
#include <sys/stat.h>
#include <sys/vfs.h>
#include <sys/xattr.h>
#include <unistd.h>

namespace platform {
namespace {

/// How many names beside its own are tried for what was displaced by mistake.
constexpr int placesBeside = 50;

/// File systems whose other users change them without this kernel's knowledge (statfs numbers).
bool isNetworkMount(const struct statfs& disk) {
    switch (static_cast<std::uint32_t>(disk.f_type)) {
    case 0x6969:     // NFS
    case 0xFF534D42: // CIFS
    case 0xFE534D42: // SMB2
    case 0x517B:     // SMB
    case 0x65735546: // FUSE
    case 0x01021997: // 9P
    case 0x00C36400: // Ceph
    case 0x5346414F: // AFS
        return true;
    default:
        return false;
    }
}

} // namespace

/// A content that waits in the trash for its place.
struct FolderRemote::Upload {
    RemoteTrash::Opened staged;
    FileAttributes attributes;

    /// Removes what waits there as long as it is what was put there.
    void discard() const {
        const Result<FileAttributes> now = FileManager::attributes(staged.path, FollowLinks::no);
        if (now && now->identity == attributes.identity)
            unlink(staged.path.c_str());
    }
};

Error FolderRemote::refused(const Error& error, const std::string& path) const {
    const std::string name(nameOf(path));
    if (error.is(ErrorCode::outOfSpace))
        return makeError(ErrorCode::quotaExceeded, name);
    if (error.is(ErrorCode::nameTooLong) || error.is(ErrorCode::invalidArgument))
        return nameRefusedError(name, error.localizedFailureReason.value_or(std::string()));
    return namedForPeople(translated(error), name);
}

Failure FolderRemote::checkChange(const std::string& path, CancelFlag& cancel) const {
    if (cancel.isCancelled())
        return makeError(ErrorCode::userCancelled);
    if (Failure failure = checkRoot())
        return failure;
    if (Failure problem = remoteNameProblem(path, nameOf(path)))
        return problem;
    for (std::size_t slash = path.find('/'); slash != std::string::npos;
         slash = path.find('/', slash + 1)) {
        const std::string folder = pathOf(path.substr(0, slash));
        const Result<FileAttributes> attributes = FileManager::attributes(folder, FollowLinks::no);
        if (!attributes)
            return translated(attributes.error());
        const std::lock_guard lock(mutex_);
        if (attributes->kind != FileKind::directory ||
            attributes->identity.device != identity_.device)
            return makeError(ErrorCode::noSuchItem, nameOf(folder));
    }
    return std::nullopt;
}

Result<FileAttributes> FolderRemote::checkVersion(const std::string& path,
                                                  const std::string& etag) const {
    const Result<FileAttributes> standing = FileManager::attributes(pathOf(path), FollowLinks::no);
    if (!standing)
        return translated(standing.error());
    if (standing->kind != FileKind::file || versionOf(*standing) != etag)
        return makeError(ErrorCode::changedRemotely, nameOf(path));
    return standing;
}

Result<RemoteEntry> FolderRemote::readBack(const std::string& path,
                                           const FileAttributes& expected) const {
    const std::string full = pathOf(path);
    const Result<FileAttributes> standing = FileManager::attributes(full, FollowLinks::no);
    if (!standing)
        return translated(standing.error());
    std::string reason;
    std::optional<RemoteEntry> entry = entryOf(full, nameOf(path), *standing, reason);
    const bool same = standing->kind == FileKind::file ? sameContent(*standing, expected)
                                                       : standing->identity == expected.identity;
    if (!entry || !same) // done, and undone by somebody in the same moment
        return makeError(ErrorCode::itemBusy, nameOf(path));
    return std::move(*entry);
}

Failure FolderRemote::putBack(const std::string& from, const std::string& path) const {
    const std::string place = pathOf(path);
    Failure failure = FileManager::moveItem(Url::file(from), Url::file(place));
    for (int number = 1; failure && failure->is(ErrorCode::fileExists) && number <= placesBeside;
         ++number) {
        const std::string beside =
            std::string(folderOf(place)) + '/' +
            conflictName(nameOf(place), ItemKind::file, clock_.now(), deviceName(), number);
        failure = FileManager::moveItem(Url::file(from), Url::file(beside));
    }
    if (failure)
        platformLog(LogLevel::error, "cloud: “%@” was displaced by mistake and lies at %@: %@",
                    path, from, *failure);
    return failure;
}

Failure FolderRemote::fill(Upload& upload, const RemoteUpload& content, CancelFlag& cancel) const {
    const int file = upload.staged.file.get();
    const auto failed = [&] { return posixError(errno, Url::file(upload.staged.path), true); };
    if (content.size > 0 && fallocate(file, 0, 0, static_cast<off_t>(content.size)) != 0 &&
        (errno == ENOSPC || errno == EDQUOT || errno == EFBIG))
        return failed();
    std::vector<std::byte> buffer(std::min<std::uint64_t>(pieceSize, content.size + 1));
    std::uint64_t total = 0;
    for (;;) {
        if (cancel.isCancelled())
            return makeError(ErrorCode::userCancelled);
        const Result<std::size_t> got = content.read(total, buffer);
        if (!got)
            return got.error();
        if (*got == 0)
            break;
        for (std::size_t done = 0; done < *got;) {
            const ssize_t wrote = ::write(file, buffer.data() + done, *got - done);
            if (wrote < 0 && errno != EINTR)
                return failed();
            done += static_cast<std::size_t>(std::max<ssize_t>(wrote, 0));
        }
        total += *got;
    }
    if (total != content.size)
        return makeError(ErrorCode::changedWhileRead, nameOf(upload.staged.path));
    if (!content.tags.empty() &&
        fsetxattr(file, "user.xdg.tags", content.tags.data(), content.tags.size(), 0) != 0 &&
        errno != EOPNOTSUPP)
        return failed();
    const timespec times[2] = {
        {0, UTIME_OMIT},
        {content.modified.wholeSeconds(),
         content.modified.nanoseconds - content.modified.wholeSeconds() * 1'000'000'000}};
    // Its bytes are on the disk before it has a name that others see.
    if (futimens(file, times) != 0 || fsync(file) != 0)
        return failed();
    const Result<FileAttributes> attributes =
        FileManager::attributes(upload.staged.path, FollowLinks::no);
    if (!attributes)
        return attributes.error();
    upload.attributes = *attributes;
    return std::nullopt;
}

Result<RemoteEntry> FolderRemote::write(const std::string& path, const RemoteUpload& content,
                                        const RemoteCondition& condition, CancelFlag& cancel) {
    if (Failure failure = checkChange(path, cancel))
        return *failure;
    if (condition.etag) // before the work; the exchange checks it again
        if (const Result<FileAttributes> standing = checkVersion(path, *condition.etag); !standing)
            return standing.error();
    Result<RemoteTrash::Opened> staged = trash_.open(path);
    if (!staged)
        return refused(staged.error(), path);
    Upload upload{std::move(*staged), {}};
    if (Failure failure = fill(upload, content, cancel)) {
        unlink(upload.staged.path.c_str());
        return refused(*failure, path);
    }
    const Failure failure = condition.etag ? replace(upload, path, *condition.etag)
                                           : FileManager::moveItem(Url::file(upload.staged.path),
                                                                   Url::file(pathOf(path)));
    if (failure) {
        upload.discard();
        return refused(*failure, path);
    }
    return readBack(path, upload.attributes);
}

Failure FolderRemote::replace(Upload& upload, const std::string& path,
                              const std::string& etag) const {
    const Result<FileAttributes> before = checkVersion(path, etag);
    if (!before)
        return before.error();
    const Url waiting = Url::file(upload.staged.path);
    const Url place = Url::file(pathOf(path));
    Failure failure = FileManager::exchangeItems(waiting, place);
    if (failure && failure->is(ErrorCode::unsupportedOperation))
        return replaceInSteps(upload, path, *before);
    if (failure)
        return failure;
    const Result<FileAttributes> displaced =
        FileManager::attributes(waiting.path(), FollowLinks::no);
    if (displaced && sameContent(*displaced, *before))
        return std::nullopt; // and it lies in the trash already
    // Somebody was faster by a moment. What they wrote gets its place again.
    const Failure back = FileManager::exchangeItems(waiting, place);
    const Result<FileAttributes> ours = FileManager::attributes(waiting.path(), FollowLinks::no);
    if (back || (ours && ours->identity != upload.attributes.identity))
        if (Failure lost = putBack(waiting.path(), path))
            return lost;
    return makeError(ErrorCode::changedRemotely, nameOf(path));
}

Failure FolderRemote::replaceInSteps(Upload& upload, const std::string& path,
                                     const FileAttributes& before) const {
    const std::string place = pathOf(path);
    const Result<std::string> trashed = trash_.take(place, path);
    if (!trashed)
        return trashed.error();
    const Result<FileAttributes> displaced = FileManager::attributes(*trashed, FollowLinks::no);
    const bool expected = displaced && sameContent(*displaced, before);
    Failure failure = makeError(ErrorCode::changedRemotely, nameOf(path));
    if (expected)
        failure = FileManager::moveItem(Url::file(upload.staged.path), Url::file(place));
    if (!failure)
        return std::nullopt;
    if (expected && failure->is(ErrorCode::fileExists))
        return makeError(ErrorCode::changedRemotely, nameOf(path)); // somebody's new one stays
    if (Failure lost = putBack(*trashed, path))
        return lost;
    return failure;
}

Result<RemoteEntry> FolderRemote::makeFolder(const std::string& path, CancelFlag& cancel) {
    if (Failure failure = checkChange(path, cancel))
        return *failure;
    if (Failure failure = FileManager::createDirectory(Url::file(pathOf(path), true), false))
        return refused(*failure, path);
    const Result<FileAttributes> made = FileManager::attributes(pathOf(path), FollowLinks::no);
    if (!made)
        return translated(made.error());
    return readBack(path, *made);
}

Result<RemoteEntry> FolderRemote::move(const std::string& from, const std::string& to,
                                       const std::string& etag, CancelFlag& cancel) {
    for (const std::string* path : {&from, &to})
        if (Failure failure = checkChange(*path, cancel))
            return *failure;
    const Result<FileAttributes> before =
        etag.empty() ? FileManager::attributes(pathOf(from), FollowLinks::no)
                     : checkVersion(from, etag);
    if (!before)
        return translated(before.error());
    if (Failure failure = FileManager::moveItem(Url::file(pathOf(from)), Url::file(pathOf(to))))
        return refused(*failure, to);
    const Result<FileAttributes> moved = FileManager::attributes(pathOf(to), FollowLinks::no);
    if (moved && !etag.empty() && !sameContent(*moved, *before)) {
        // Changed or replaced in the last moment: it stays where whoever did that knows it.
        if (Failure lost = putBack(pathOf(to), from))
            return *lost;
        return makeError(ErrorCode::changedRemotely, nameOf(from));
    }
    return readBack(to, *before);
}

Failure FolderRemote::remove(const std::string& path, ItemKind kind, const std::string& etag,
                             CancelFlag& cancel) {
    if (Failure failure = checkChange(path, cancel))
        return failure;
    if (kind == ItemKind::folder) {
        if (rmdir(pathOf(path).c_str()) == 0)
            return std::nullopt;
        return refused(posixError(errno, Url::file(pathOf(path)), true), path);
    }
    const Result<FileAttributes> before = checkVersion(path, etag);
    if (!before)
        return before.error();
    const Result<std::string> trashed = trash_.take(pathOf(path), path);
    if (!trashed)
        return refused(trashed.error(), path);
    const Result<FileAttributes> displaced = FileManager::attributes(*trashed, FollowLinks::no);
    if (displaced && sameContent(*displaced, *before))
        return std::nullopt;
    if (Failure lost = putBack(*trashed, path))
        return lost;
    return makeError(ErrorCode::changedRemotely, nameOf(path));
}

Failure FolderRemote::sync(CancelFlag& cancel) {
    if (cancel.isCancelled())
        return makeError(ErrorCode::userCancelled);
    if (Failure failure = checkRoot())
        return failure;
    const FileDescriptor folder(open(root_.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
    if (!folder || syncfs(folder.get()) != 0)
        return translated(posixError(errno, Url::file(root_), true));
    return std::nullopt;
}

std::optional<std::string> FolderRemote::watchableFolder() const {
    struct statfs disk {};
    if (statfs(root_.c_str(), &disk) != 0 || isNetworkMount(disk))
        return std::nullopt;
    return root_;
}

} // namespace platform
