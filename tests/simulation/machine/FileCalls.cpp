// The C library's file calls for the whole program: what concerns a simulated path or descriptor goes
// to the simulated machine, everything else to the C library. (FileManager and the store make few
// calls, SQLite some more; what nobody makes is not here.)

#include "tests/simulation/machine/Fibers.h"
#include "tests/simulation/machine/Machine.h"
#include "tests/simulation/machine/RealCall.h"

#include <cerrno>
#include <climits>
#include <cstdarg>
#include <cstring>
#include <fcntl.h>
#include <poll.h>
#include <sys/eventfd.h>
#include <sys/mman.h>
#include <sys/statvfs.h>

namespace {

using namespace simulation; // NOLINT: the calls below belong to the C library's namespace

Machine& machine() {
    return Machine::shared();
}

template<class Number>
Number answer(Number result) {
    if (result >= 0)
        return result;
    errno = static_cast<int>(-result);
    return -1;
}

bool ours(const char* path) {
    return Machine::ownsPath(path);
}
bool ours(int folder, const char* path) {
    return machine().ownsFile(folder) ? path[0] != '/' || ours(path) : ours(path);
}
bool ours(int file) {
    return machine().ownsFile(file);
}

/// "/proc/self/fd/N" of a simulated file, which some use to name an open file; -1 for all others.
int fileOfProcPath(const char* path) {
    constexpr std::string_view head = "/proc/self/fd/";
    if (!path || !std::string_view(path).starts_with(head))
        return -1;
    const int file = std::atoi(path + head.size());
    return ours(file) ? file : -1;
}

long statOf(int folder, const char* path, int flags, struct stat* out) {
    struct statx info {};
    const long number = machine().attributes(folder, path, flags, &info);
    if (number != 0)
        return number;
    *out = {};
    const int opened = machine().open(folder, path, O_PATH | O_NOFOLLOW, 0);
    out->st_dev = opened >= 0 ? machine().device(opened) : info.stx_dev_minor;
    if (opened >= 0)
        machine().close(opened);
    out->st_ino = info.stx_ino;
    out->st_mode = info.stx_mode;
    out->st_nlink = info.stx_nlink;
    out->st_size = static_cast<off_t>(info.stx_size);
    out->st_blksize = 4096;
    out->st_blocks = static_cast<blkcnt_t>(info.stx_blocks);
    out->st_mtim = {info.stx_mtime.tv_sec, info.stx_mtime.tv_nsec};
    out->st_ctim = {info.stx_ctime.tv_sec, info.stx_ctime.tv_nsec};
    out->st_uid = info.stx_uid;
    return 0;
}

long statOfFile(int file, struct stat* out) {
    struct statx info {};
    const long number = machine().attributes(file, "", AT_EMPTY_PATH, &info);
    if (number != 0)
        return number;
    *out = {};
    out->st_dev = machine().device(file);
    out->st_ino = info.stx_ino;
    out->st_mode = info.stx_mode;
    out->st_nlink = info.stx_nlink;
    out->st_size = static_cast<off_t>(info.stx_size);
    out->st_blksize = 4096;
    out->st_mtim = {info.stx_mtime.tv_sec, info.stx_mtime.tv_nsec};
    out->st_ctim = {info.stx_ctime.tv_sec, info.stx_ctime.tv_nsec};
    out->st_uid = info.stx_uid;
    return 0;
}

int roomOf(const char* path, int file, struct statvfs* out) {
    std::uint64_t free = 0;
    std::uint64_t total = 0;
    if (const long number = machine().room(path, file, free, total))
        return static_cast<int>(answer(number));
    *out = {};
    out->f_bsize = out->f_frsize = 1;
    out->f_blocks = total;
    out->f_bfree = out->f_bavail = free;
    out->f_namemax = 255;
    return 0;
}

mode_t modeArgument(int flags, va_list list) {
    return flags & O_CREAT ? static_cast<mode_t>(va_arg(list, int)) : 0;
}

} // namespace

#define FORWARD(type, name, ...)                                                                   \
    static auto* const real = realCall<type>(name);                                                \
    return real(__VA_ARGS__)

#define OPEN_CALL(name)                                                                            \
    SIMULATED(int, name, const char* path, int flags, ...) {                                       \
        va_list list;                                                                              \
        va_start(list, flags);                                                                     \
        const mode_t mode = modeArgument(flags, list);                                             \
        va_end(list);                                                                              \
        if (ours(path))                                                                            \
            return answer(machine().open(-1, path, flags, mode));                                  \
        FORWARD(int(const char*, int, ...), #name, path, flags, mode);                             \
    }
OPEN_CALL(open)
OPEN_CALL(open64)

#define OPENAT_CALL(name)                                                                          \
    SIMULATED(int, name, int folder, const char* path, int flags, ...) {                           \
        va_list list;                                                                              \
        va_start(list, flags);                                                                     \
        const mode_t mode = modeArgument(flags, list);                                             \
        va_end(list);                                                                              \
        if (ours(folder, path))                                                                    \
            return answer(machine().open(folder, path, flags, mode));                              \
        FORWARD(int(int, const char*, int, ...), #name, folder, path, flags, mode);                \
    }
OPENAT_CALL(openat)
OPENAT_CALL(openat64)

SIMULATED(int, close, int file) {
    if (ours(file))
        return answer(machine().close(file));
    FORWARD(int(int), "close", file);
}

SIMULATED(ssize_t, read, int file, void* buffer, size_t size) {
    if (ours(file))
        return answer(machine().read(file, buffer, size, -1));
    FORWARD(ssize_t(int, void*, size_t), "read", file, buffer, size);
}

SIMULATED(ssize_t, write, int file, const void* buffer, size_t size) {
    if (ours(file))
        return answer(machine().write(file, buffer, size, -1));
    FORWARD(ssize_t(int, const void*, size_t), "write", file, buffer, size);
}

#define PREAD_CALL(name)                                                                           \
    SIMULATED(ssize_t, name, int file, void* buffer, size_t size, off_t offset) {                  \
        if (ours(file))                                                                            \
            return answer(machine().read(file, buffer, size, offset));                             \
        FORWARD(ssize_t(int, void*, size_t, off_t), #name, file, buffer, size, offset);            \
    }
PREAD_CALL(pread)
PREAD_CALL(pread64)

#define PWRITE_CALL(name)                                                                          \
    SIMULATED(ssize_t, name, int file, const void* buffer, size_t size, off_t offset) {            \
        if (ours(file))                                                                            \
            return answer(machine().write(file, buffer, size, offset));                            \
        FORWARD(ssize_t(int, const void*, size_t, off_t), #name, file, buffer, size, offset);      \
    }
PWRITE_CALL(pwrite)
PWRITE_CALL(pwrite64)

#define SEEK_CALL(name)                                                                            \
    SIMULATED(off_t, name, int file, off_t offset, int whence) {                                   \
        if (ours(file))                                                                            \
            return answer(machine().seek(file, offset, whence));                                   \
        FORWARD(off_t(int, off_t, int), #name, file, offset, whence);                              \
    }
SEEK_CALL(lseek)
SEEK_CALL(lseek64)

#define TRUNCATE_CALL(name)                                                                        \
    SIMULATED(int, name, int file, off_t size) {                                                   \
        if (ours(file))                                                                            \
            return static_cast<int>(                                                               \
                answer(machine().truncate(file, static_cast<std::uint64_t>(size))));               \
        FORWARD(int(int, off_t), #name, file, size);                                               \
    }
TRUNCATE_CALL(ftruncate)
TRUNCATE_CALL(ftruncate64)

#define FALLOCATE_CALL(name)                                                                       \
    SIMULATED(int, name, int file, int mode, off_t offset, off_t size) {                           \
        if (ours(file))                                                                            \
            return static_cast<int>(                                                               \
                answer(machine().reserve(file, static_cast<std::uint64_t>(offset + size))));       \
        FORWARD(int(int, int, off_t, off_t), #name, file, mode, offset, size);                     \
    }
FALLOCATE_CALL(fallocate)
FALLOCATE_CALL(fallocate64)

#define SYNC_CALL(name, everything)                                                                \
    SIMULATED(int, name, int file) {                                                               \
        if (ours(file))                                                                            \
            return static_cast<int>(answer(machine().sync(file, everything)));                     \
        FORWARD(int(int), #name, file);                                                            \
    }
SYNC_CALL(fsync, false)
SYNC_CALL(fdatasync, false)
SYNC_CALL(syncfs, true)

SIMULATED(int, statx, int folder, const char* path, int flags, unsigned mask, struct statx* info) {
    if (const int file = fileOfProcPath(path); file >= 0)
        return static_cast<int>(answer(machine().attributes(file, "", AT_EMPTY_PATH, info)));
    if (ours(folder, path))
        return static_cast<int>(answer(machine().attributes(folder, path, flags, info)));
    FORWARD(int(int, const char*, int, unsigned, struct statx*), "statx", folder, path, flags, mask,
            info);
}

#define STAT_CALL(name, flags)                                                                     \
    SIMULATED(int, name, const char* path, struct stat* info) {                                    \
        if (ours(path))                                                                            \
            return static_cast<int>(answer(statOf(-1, path, flags, info)));                        \
        FORWARD(int(const char*, struct stat*), #name, path, info);                                \
    }
STAT_CALL(stat, 0)
STAT_CALL(stat64, 0)
STAT_CALL(lstat, AT_SYMLINK_NOFOLLOW)
STAT_CALL(lstat64, AT_SYMLINK_NOFOLLOW)

#define FSTAT_CALL(name)                                                                           \
    SIMULATED(int, name, int file, struct stat* info) {                                            \
        if (ours(file))                                                                            \
            return static_cast<int>(answer(statOfFile(file, info)));                               \
        FORWARD(int(int, struct stat*), #name, file, info);                                        \
    }
FSTAT_CALL(fstat)
FSTAT_CALL(fstat64)

#define FSTATAT_CALL(name)                                                                         \
    SIMULATED(int, name, int folder, const char* path, struct stat* info, int flags) {             \
        if (ours(folder, path))                                                                    \
            return static_cast<int>(answer(statOf(folder, path, flags, info)));                    \
        FORWARD(int(int, const char*, struct stat*, int), #name, folder, path, info, flags);       \
    }
FSTATAT_CALL(fstatat)
FSTATAT_CALL(fstatat64)

SIMULATED(int, mkdir, const char* path, mode_t mode) {
    if (ours(path))
        return static_cast<int>(answer(machine().makeFolder(-1, path, mode)));
    FORWARD(int(const char*, mode_t), "mkdir", path, mode);
}

SIMULATED(int, mkdirat, int folder, const char* path, mode_t mode) {
    if (ours(folder, path))
        return static_cast<int>(answer(machine().makeFolder(folder, path, mode)));
    FORWARD(int(int, const char*, mode_t), "mkdirat", folder, path, mode);
}

SIMULATED(int, rmdir, const char* path) {
    if (ours(path))
        return static_cast<int>(answer(machine().remove(-1, path, true)));
    FORWARD(int(const char*), "rmdir", path);
}

SIMULATED(int, unlink, const char* path) {
    if (ours(path))
        return static_cast<int>(answer(machine().remove(-1, path, false)));
    FORWARD(int(const char*), "unlink", path);
}

SIMULATED(int, unlinkat, int folder, const char* path, int flags) {
    if (ours(folder, path))
        return static_cast<int>(
            answer(machine().remove(folder, path, (flags & AT_REMOVEDIR) != 0)));
    FORWARD(int(int, const char*, int), "unlinkat", folder, path, flags);
}

SIMULATED(int, rename, const char* from, const char* to) {
    if (ours(from) || ours(to))
        return static_cast<int>(answer(machine().rename(-1, from, -1, to, 0)));
    FORWARD(int(const char*, const char*), "rename", from, to);
}

SIMULATED(int, renameat2, int fromFolder, const char* from, int toFolder, const char* to,
          unsigned flags) {
    if (ours(fromFolder, from) || ours(toFolder, to))
        return static_cast<int>(answer(machine().rename(fromFolder, from, toFolder, to, flags)));
    FORWARD(int(int, const char*, int, const char*, unsigned), "renameat2", fromFolder, from,
            toFolder, to, flags);
}

SIMULATED(int, link, const char* from, const char* to) {
    if (ours(from) || ours(to))
        return static_cast<int>(answer(machine().link(-1, from, -1, to, 0)));
    FORWARD(int(const char*, const char*), "link", from, to);
}

SIMULATED(int, linkat, int fromFolder, const char* from, int toFolder, const char* to, int flags) {
    if (const int file = fileOfProcPath(from); file >= 0)
        return static_cast<int>(answer(machine().link(file, "", toFolder, to, AT_EMPTY_PATH)));
    if (ours(fromFolder, from) || ours(toFolder, to))
        return static_cast<int>(answer(machine().link(fromFolder, from, toFolder, to, flags)));
    FORWARD(int(int, const char*, int, const char*, int), "linkat", fromFolder, from, toFolder, to,
            flags);
}

SIMULATED(int, symlink, const char* target, const char* path) {
    if (ours(path))
        return static_cast<int>(answer(machine().symlink(target, -1, path)));
    FORWARD(int(const char*, const char*), "symlink", target, path);
}

SIMULATED(ssize_t, readlink, const char* path, char* buffer, size_t size) {
    if (ours(path))
        return answer(machine().readLink(-1, path, buffer, size));
    FORWARD(ssize_t(const char*, char*, size_t), "readlink", path, buffer, size);
}

SIMULATED(int, access, const char* path, int mode) {
    if (!ours(path))
        return realCall<int(const char*, int)>("access")(path, mode);
    struct statx info {};
    return static_cast<int>(answer(machine().attributes(-1, path, 0, &info)));
}

SIMULATED(ssize_t, getdents64, int file, void* buffer, size_t size) {
    if (ours(file))
        return answer(machine().names(file, buffer, size));
    FORWARD(ssize_t(int, void*, size_t), "getdents64", file, buffer, size);
}

SIMULATED(int, futimens, int file, const timespec* times) {
    if (ours(file))
        return static_cast<int>(answer(machine().setTimes(file, "", times, 0)));
    FORWARD(int(int, const timespec*), "futimens", file, times);
}

SIMULATED(int, utimensat, int folder, const char* path, const timespec* times, int flags) {
    if (ours(folder, path))
        return static_cast<int>(answer(machine().setTimes(folder, path, times, flags)));
    FORWARD(int(int, const char*, const timespec*, int), "utimensat", folder, path, times, flags);
}

#define GETXATTR_CALL(name, follow)                                                                \
    SIMULATED(ssize_t, name, const char* path, const char* attribute, void* value, size_t size) {  \
        if (ours(path))                                                                            \
            return answer(machine().attribute(-1, path, follow, attribute, value, size));          \
        FORWARD(ssize_t(const char*, const char*, void*, size_t), #name, path, attribute, value,   \
                size);                                                                             \
    }
GETXATTR_CALL(getxattr, true)
GETXATTR_CALL(lgetxattr, false)

SIMULATED(ssize_t, fgetxattr, int file, const char* attribute, void* value, size_t size) {
    if (ours(file))
        return answer(machine().attribute(file, "", true, attribute, value, size));
    FORWARD(ssize_t(int, const char*, void*, size_t), "fgetxattr", file, attribute, value, size);
}

#define LISTXATTR_CALL(name, follow)                                                               \
    SIMULATED(ssize_t, name, const char* path, char* list, size_t size) {                          \
        if (ours(path))                                                                            \
            return answer(machine().attributeNames(-1, path, follow, list, size));                 \
        FORWARD(ssize_t(const char*, char*, size_t), #name, path, list, size);                     \
    }
LISTXATTR_CALL(listxattr, true)
LISTXATTR_CALL(llistxattr, false)

SIMULATED(ssize_t, flistxattr, int file, char* list, size_t size) {
    if (ours(file))
        return answer(machine().attributeNames(file, "", true, list, size));
    FORWARD(ssize_t(int, char*, size_t), "flistxattr", file, list, size);
}

#define SETXATTR_CALL(name)                                                                        \
    SIMULATED(int, name, const char* path, const char* attribute, const void* value, size_t size,  \
              int flags) {                                                                         \
        if (ours(path))                                                                            \
            return static_cast<int>(answer(machine().setAttribute(                                 \
                -1, path, attribute, {static_cast<const char*>(value), size}, flags)));            \
        FORWARD(int(const char*, const char*, const void*, size_t, int), #name, path, attribute,   \
                value, size, flags);                                                               \
    }
SETXATTR_CALL(setxattr)
SETXATTR_CALL(lsetxattr)

SIMULATED(int, fsetxattr, int file, const char* attribute, const void* value, size_t size,
          int flags) {
    if (ours(file))
        return static_cast<int>(answer(machine().setAttribute(
            file, "", attribute, {static_cast<const char*>(value), size}, flags)));
    FORWARD(int(int, const char*, const void*, size_t, int), "fsetxattr", file, attribute, value,
            size, flags);
}

#define REMOVEXATTR_CALL(name)                                                                     \
    SIMULATED(int, name, const char* path, const char* attribute) {                                \
        if (ours(path))                                                                            \
            return static_cast<int>(answer(machine().removeAttribute(-1, path, attribute)));       \
        FORWARD(int(const char*, const char*), #name, path, attribute);                            \
    }
REMOVEXATTR_CALL(removexattr)
REMOVEXATTR_CALL(lremovexattr)

SIMULATED(int, flock, int file, int operation) {
    if (ours(file))
        return 0; // there is one program that keeps stores on this machine
    FORWARD(int(int, int), "flock", file, operation);
}

#define FCNTL_CALL(name)                                                                           \
    SIMULATED(int, name, int file, int command, ...) {                                             \
        va_list list;                                                                              \
        va_start(list, command);                                                                   \
        void* const argument = va_arg(list, void*);                                                \
        va_end(list);                                                                              \
        if (ours(file)) {                                                                          \
            if (command == F_GETLK || command == F_OFD_GETLK)                                      \
                static_cast<struct flock*>(argument)->l_type = F_UNLCK;                            \
            return 0;                                                                              \
        }                                                                                          \
        FORWARD(int(int, int, ...), #name, file, command, argument);                               \
    }
FCNTL_CALL(fcntl)
FCNTL_CALL(fcntl64)

SIMULATED(int, ioctl, int file, unsigned long request, ...) {
    va_list list;
    va_start(list, request);
    void* const argument = va_arg(list, void*);
    va_end(list);
    if (ours(file))
        return answer(-EOPNOTSUPP);
    FORWARD(int(int, unsigned long, ...), "ioctl", file, request, argument);
}

#define STATVFS_CALL(name)                                                                         \
    SIMULATED(int, name, const char* path, struct statvfs* info) {                                 \
        if (ours(path))                                                                            \
            return roomOf(path, -1, info);                                                         \
        FORWARD(int(const char*, struct statvfs*), #name, path, info);                             \
    }
STATVFS_CALL(statvfs)
STATVFS_CALL(statvfs64)

SIMULATED(int, fstatvfs, int file, struct statvfs* info) {
    if (ours(file))
        return roomOf("", file, info);
    FORWARD(int(int, struct statvfs*), "fstatvfs", file, info);
}

SIMULATED(char*, realpath, const char* path, char* resolved) {
    if (!ours(path))
        return realCall<char*(const char*, char*)>("realpath")(path, resolved);
    struct statx info {};
    if (answer(machine().attributes(-1, path, 0, &info)) != 0)
        return nullptr;
    return resolved ? std::strcpy(resolved, path) : strdup(path);
}

SIMULATED(ssize_t, copy_file_range, int from, off_t* fromOffset, int to, off_t* toOffset,
          size_t size, unsigned flags) {
    if (ours(from) || ours(to))
        return answer<ssize_t>(-EXDEV); // makes the caller copy by itself
    FORWARD(ssize_t(int, off_t*, int, off_t*, size_t, unsigned), "copy_file_range", from, fromOffset,
            to, toOffset, size, flags);
}

#define FADVISE_CALL(name)                                                                         \
    SIMULATED(int, name, int file, off_t offset, off_t size, int advice) {                         \
        if (ours(file))                                                                            \
            return 0;                                                                              \
        FORWARD(int(int, off_t, off_t, int), #name, file, offset, size, advice);                   \
    }
FADVISE_CALL(posix_fadvise)
FADVISE_CALL(posix_fadvise64)

SIMULATED(int, fchmod, int file, mode_t mode) {
    if (ours(file))
        return 0;
    FORWARD(int(int, mode_t), "fchmod", file, mode);
}

SIMULATED(int, fchown, int file, uid_t user, gid_t group) {
    if (ours(file))
        return 0;
    FORWARD(int(int, uid_t, gid_t), "fchown", file, user, group);
}

/// Only the database library's shared index is ever mapped, and only within this process: plain
/// memory serves.
#define MMAP_CALL(name)                                                                            \
    SIMULATED(void*, name, void* at, size_t size, int protection, int flags, int file,             \
              off_t offset) {                                                                      \
        static auto* const real = realCall<void*(void*, size_t, int, int, int, off_t)>(#name);     \
        if (ours(file))                                                                            \
            return real(nullptr, size, PROT_READ | PROT_WRITE, MAP_SHARED | MAP_ANONYMOUS, -1, 0); \
        return real(at, size, protection, flags, file, offset);                                    \
    }
MMAP_CALL(mmap)
MMAP_CALL(mmap64)

SIMULATED(ssize_t, getrandom, void* buffer, size_t size, unsigned flags) {
    if (!Fibers::shared().active())
        return realCall<ssize_t(void*, size_t, unsigned)>("getrandom")(buffer, size, flags);
    for (size_t i = 0; i < size; ++i)
        static_cast<unsigned char*>(buffer)[i] =
            static_cast<unsigned char>(machine().luck().next());
    return static_cast<ssize_t>(size);
}

SIMULATED(int, poll, pollfd* files, nfds_t count, int timeout) {
    if (!Fibers::shared().active())
        return realCall<int(pollfd*, nfds_t, int)>("poll")(files, count, timeout);
    return machine().poll(files, count, timeout);
}

SIMULATED(int, eventfd, unsigned count, int flags) {
    if (!Fibers::shared().active())
        return realCall<int(unsigned, int)>("eventfd")(count, flags);
    return machine().makeEvent();
}

SIMULATED(int, eventfd_read, int file, eventfd_t* value) {
    return read(file, value, sizeof *value) == sizeof *value ? 0 : -1;
}

SIMULATED(int, eventfd_write, int file, eventfd_t value) {
    return write(file, &value, sizeof value) == sizeof value ? 0 : -1;
}

SIMULATED(int, inotify_init1, int flags) {
    if (!Fibers::shared().active() || machine().mounts().empty())
        return realCall<int(int)>("inotify_init1")(flags);
    return machine().makeNotices();
}

SIMULATED(int, inotify_add_watch, int file, const char* path, uint32_t mask) {
    if (ours(file))
        return answer(machine().watch(file, path, mask));
    FORWARD(int(int, const char*, uint32_t), "inotify_add_watch", file, path, mask);
}

SIMULATED(int, inotify_rm_watch, int file, int watch) {
    if (ours(file))
        return static_cast<int>(answer(machine().unwatch(file, watch)));
    FORWARD(int(int, int), "inotify_rm_watch", file, watch);
}
