#include "platform/files/FileDescriptor.h"
#include "platform/files/FileManager.h"
#include "platform/files/PathText.h"

#include <algorithm>
#include <cerrno>
#include <fcntl.h>
#include <linux/fs.h>
#include <memory>
#include <sys/ioctl.h>
#include <sys/stat.h>

namespace platform {
namespace {

constexpr std::size_t copyStep = 1024UL * 1024;

/// Copies [start, end) through memory.
int copyThroughMemory(int from, int to, off_t start, off_t end) {
    const auto buffer = std::make_unique_for_overwrite<char[]>(copyStep);
    while (start < end) {
        const auto wanted = std::min<std::size_t>(copyStep, static_cast<std::size_t>(end - start));
        const ssize_t got = ::pread(from, buffer.get(), wanted, start);
        if (got == 0)
            return 0; // the file became shorter; the caller notices
        if (got < 0 && errno == EINTR)
            continue;
        if (got < 0)
            return errno;
        for (ssize_t done = 0; done < got;) {
            const ssize_t put = ::pwrite(to, buffer.get() + done,
                                         static_cast<std::size_t>(got - done), start + done);
            if (put < 0 && errno != EINTR)
                return errno;
            done += std::max<ssize_t>(put, 0);
        }
        start += got;
    }
    return 0;
}

bool copyRangeUnsupported(int number) {
    return number == EXDEV || number == EINVAL || number == ENOSYS || number == EOPNOTSUPP ||
           number == EBADF || number == EPERM;
}

/// Copies [start, end) inside the kernel, which shares the blocks where the file system can.
int copyRange(int from, int to, off_t start, off_t end) {
    off_t source = start;
    off_t target = start;
    while (source < end) {
        const ssize_t got = ::copy_file_range(from, &source, to, &target,
                                              static_cast<std::size_t>(end - source), 0);
        if (got > 0)
            continue;
        if (got < 0 && errno == EINTR)
            continue;
        if (got < 0 && !copyRangeUnsupported(errno))
            return errno;
        // 0 bytes before the end: some file systems cannot, and say so that way.
        return copyThroughMemory(from, to, source, end);
    }
    return 0;
}

/// Copies the parts that hold data; holes stay holes.
int copyExtents(int from, int to, off_t size) {
    if (::ioctl(to, FICLONE, from) == 0)
        return 0;
    for (off_t at = 0; at < size;) {
        off_t start = ::lseek(from, at, SEEK_DATA);
        if (start < 0 && errno == ENXIO)
            break; // only a hole follows
        const bool mapped = start >= 0;
        start = mapped ? start : at;
        const off_t end = mapped ? std::min(::lseek(from, start, SEEK_HOLE), size) : size;
        if (end < start)
            return errno;
        if (const int number = copyRange(from, to, start, end))
            return number;
        at = end;
    }
    return ::ftruncate(to, size) == 0 ? 0 : errno;
}

int copyContent(int from, int to, const struct stat& info) {
    if (const int number = copyExtents(from, to, info.st_size))
        return number;
    const timespec times[2] = {info.st_atim, info.st_mtim};
    return ::futimens(to, times) == 0 ? 0 : errno;
}

bool changed(const struct stat& before, const struct stat& now) {
    return before.st_size != now.st_size || before.st_mtim.tv_sec != now.st_mtim.tv_sec ||
           before.st_mtim.tv_nsec != now.st_mtim.tv_nsec;
}

} // namespace

Failure FileManager::copyFile(const Url& from, const Url& to) {
    const FileDescriptor source(
        ::open(PathText(from.path()).c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK));
    struct stat info {};
    if (!source || ::fstat(source.get(), &info) != 0)
        return posixError(errno, from, false);
    if (!S_ISREG(info.st_mode))
        return posixError(EINVAL, from, false);
    const PathText target(to.path());
    FileDescriptor copy(
        ::open(target.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, info.st_mode & 0777));
    if (!copy)
        return posixError(errno, to, true);
    Failure failure;
    struct stat now {};
    if (const int number = copyContent(source.get(), copy.get(), info))
        failure = posixError(number, to, true);
    else if (::fstat(source.get(), &now) != 0)
        failure = posixError(errno, from, false);
    else if (changed(info, now))
        failure = makeError(ErrorCode::changedWhileRead, from.lastPathComponent());
    // Some file systems report a full disk only when the file is closed.
    if (const int number = copy.release(); ::close(number) != 0 && !failure)
        failure = posixError(errno, to, true);
    if (failure)
        ::unlink(target.c_str());
    return failure;
}

} // namespace platform
