#include "platform/base/Text.h"
#include "platform/files/FileDescriptor.h"
#include "platform/files/FileManager.h"
#include "platform/files/PathText.h"

#include <cerrno>
#include <cstdio>
#include <fcntl.h>
#include <sys/stat.h>

namespace platform {
namespace {

/// Whether a file system (or a kernel) refused a flag of renameat2 rather than the move itself.
bool flagUnsupported(int number) {
    return number == EINVAL || number == ENOSYS || number == ENOTSUP;
}

int renameOver(const PathText& from, const PathText& to) {
    return std::rename(from.c_str(), to.c_str()) == 0 ? 0 : errno;
}

/// An empty folder of our own is the only thing that the rename can replace: a folder that gets
/// content meanwhile makes it fail, so nothing is lost.
int moveFolderOverEmpty(const PathText& from, const PathText& to) {
    if (::mkdir(to.c_str(), 0700) != 0)
        return errno;
    const int number = renameOver(from, to);
    if (number != 0)
        ::rmdir(to.c_str());
    return number;
}

/// A second name, then the first one goes: never replaces, and a crash in between leaves both.
int moveByLink(const PathText& from, const PathText& to) {
    if (::linkat(AT_FDCWD, from.c_str(), AT_FDCWD, to.c_str(), 0) != 0)
        return errno;
    if (::unlink(from.c_str()) == 0)
        return 0;
    const int number = errno;
    ::unlink(to.c_str());
    return number;
}

/// For file systems without hard links. What remains racy: somebody who opens the placeholder by
/// its name and writes into it before the rename, which is the next call, loses what was written.
int moveOverPlaceholder(const PathText& from, const PathText& to) {
    const FileDescriptor placeholder(
        ::open(to.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC | O_NOFOLLOW, 0600));
    if (!placeholder)
        return errno;
    const int number = renameOver(from, to);
    if (number != 0)
        ::unlink(to.c_str());
    return number;
}

/// The move without replacing where the file system lacks RENAME_NOREPLACE.
int moveInSteps(const PathText& from, const PathText& to) {
    struct stat info {};
    if (::lstat(from.c_str(), &info) != 0)
        return errno;
    if (S_ISDIR(info.st_mode))
        return moveFolderOverEmpty(from, to);
    const int number = moveByLink(from, to);
    const bool noLinks = number == EPERM || number == ENOTSUP || number == EMLINK;
    return noLinks ? moveOverPlaceholder(from, to) : number;
}

bool concernsDestination(int number) {
    return number == EEXIST || number == ENOTEMPTY || number == ENAMETOOLONG || number == ENOSPC;
}

/// EINVAL has two meanings: a flag that the file system lacks, or a folder moved into itself.
bool movesIntoItself(const Url& from, const Url& to) {
    return to.standardized().isInside(from.standardized()) && to != from;
}

} // namespace

Failure FileManager::moveItem(const Url& from, const Url& to) {
    const PathText source(from.path());
    const PathText target(to.path());
    if (::renameat2(AT_FDCWD, source.c_str(), AT_FDCWD, target.c_str(), RENAME_NOREPLACE) == 0)
        return std::nullopt;
    int number = errno;
    if (flagUnsupported(number) && !movesIntoItself(from, to))
        number = moveInSteps(source, target);
    if (number == 0)
        return std::nullopt;
    if (number == EXDEV)
        return cannotError(
            number, localizedFormat("“%1$@” lies on another disk and has to be copied there.",
                                    from.lastPathComponent()));
    return posixError(number, concernsDestination(number) ? to : from, true);
}

Failure FileManager::exchangeItems(const Url& a, const Url& b) {
    if (::renameat2(AT_FDCWD, PathText(a.path()).c_str(), AT_FDCWD, PathText(b.path()).c_str(),
                    RENAME_EXCHANGE) == 0)
        return std::nullopt;
    const int number = errno;
    if (number == EXDEV || (flagUnsupported(number) && !movesIntoItself(a, b)))
        return cannotError(number, localizedFormat("The disk cannot swap “%1$@” and “%2$@”.",
                                                   a.lastPathComponent(), b.lastPathComponent()));
    return posixError(number, a, true);
}

} // namespace platform
