#include "platform/files/FileManager.h"

#include "platform/files/FileDescriptor.h"
#include "platform/files/OpenFile.h"
#include "platform/files/PathText.h"

#include <algorithm>
#include <cerrno>
#include <fcntl.h>
#include <sys/stat.h>
#include <sys/statvfs.h>
#include <sys/sysmacros.h>

namespace platform {
namespace {

FileKind kindOfMode(std::uint32_t mode) {
    switch (mode & S_IFMT) {
    case S_IFREG:
        return FileKind::file;
    case S_IFDIR:
        return FileKind::directory;
    case S_IFLNK:
        return FileKind::symbolicLink;
    default:
        return FileKind::other;
    }
}

Date dateOf(const struct statx_timestamp& stamp) {
    return Date::fromParts(stamp.tv_sec, stamp.tv_nsec);
}

FileAttributes attributesOf(const struct statx& info) {
    FileAttributes out;
    out.kind = kindOfMode(info.stx_mode);
    out.size = info.stx_size;
    out.modified = dateOf(info.stx_mtime);
    out.changed = dateOf(info.stx_ctime);
    if ((info.stx_mask & STATX_BTIME) != 0)
        out.created = dateOf(info.stx_btime);
    out.identity = {makedev(info.stx_dev_major, info.stx_dev_minor), info.stx_ino,
                    out.created.nanoseconds};
    out.links = info.stx_nlink;
    out.mode = info.stx_mode & 07777U;
    return out;
}

/// Success when a folder stands at `path` after a failed mkdir and that is good enough.
Failure existingFolder(int number, const PathText& text, std::string_view path, bool accept) {
    struct stat info {};
    if (number == EEXIST && accept && ::stat(text.c_str(), &info) == 0 && S_ISDIR(info.st_mode))
        return std::nullopt;
    return writeError(number, path);
}

Failure makeFolder(std::string_view path, bool intermediates) {
    const PathText text(path);
    if (::mkdir(text.c_str(), 0777) == 0)
        return std::nullopt;
    const int number = errno;
    const std::string_view parent = folderOf(path);
    if (number != ENOENT || !intermediates || parent.size() >= path.size())
        return existingFolder(number, text, path, intermediates);
    if (Failure failure = makeFolder(parent, true))
        return failure;
    if (::mkdir(text.c_str(), 0777) == 0)
        return std::nullopt;
    return existingFolder(errno, text, path, true);
}

} // namespace

bool FileManager::exists(std::string_view path, bool* isDirectory) {
    struct stat info {};
    const bool found = ::stat(PathText(path).c_str(), &info) == 0;
    if (isDirectory)
        *isDirectory = found && S_ISDIR(info.st_mode);
    return found;
}

Result<FileAttributes> FileManager::attributes(std::string_view path, FollowLinks follow) {
    struct statx info {};
    const int flags = follow == FollowLinks::yes ? 0 : AT_SYMLINK_NOFOLLOW;
    if (::statx(AT_FDCWD, PathText(path).c_str(), flags, STATX_BASIC_STATS | STATX_BTIME, &info) !=
        0)
        return readError(errno, path);
    return attributesOf(info);
}

Result<FileAttributes> attributesOfOpen(int file, std::string_view path) {
    struct statx info {};
    if (::statx(file, "", AT_EMPTY_PATH, STATX_BASIC_STATS | STATX_BTIME, &info) != 0)
        return readError(errno, path);
    return attributesOf(info);
}

Failure FileManager::createDirectory(const Url& folder, bool intermediates) {
    return makeFolder(folder.path(), intermediates);
}

Result<Bytes> FileManager::contents(const Url& file, std::uint64_t limit) {
    // Opening a pipe without O_NONBLOCK would wait for its writer.
    const FileDescriptor source(
        ::open(PathText(file.path()).c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK));
    if (!source)
        return posixError(errno, file, false);
    struct stat info {};
    if (::fstat(source.get(), &info) != 0)
        return posixError(errno, file, false);
    if (!S_ISREG(info.st_mode))
        return posixError(EINVAL, file, false);
    // The size is a hint only: the file may grow meanwhile, and some file systems tell none.
    constexpr std::size_t step = 64UL * 1024;
    Bytes bytes(std::min<std::uint64_t>(static_cast<std::uint64_t>(info.st_size) + 1, limit));
    std::size_t length = 0;
    while (length < limit) {
        if (length == bytes.size())
            bytes.resize(std::min<std::uint64_t>(length + step, limit));
        const ssize_t got = ::read(source.get(), bytes.data() + length, bytes.size() - length);
        if (got == 0)
            break;
        if (got > 0)
            length += static_cast<std::size_t>(got);
        else if (errno != EINTR)
            return posixError(errno, file, false);
    }
    bytes.resize(length);
    return bytes;
}

Result<std::uint64_t> FileManager::freeBytes(std::string_view path) {
    struct statvfs info {};
    if (::statvfs(PathText(path).c_str(), &info) != 0)
        return readError(errno, path);
    return static_cast<std::uint64_t>(info.f_bavail) * info.f_frsize;
}

} // namespace platform
