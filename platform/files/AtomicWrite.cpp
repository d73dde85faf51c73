#include "platform/files/FileDescriptor.h"
#include "platform/files/FileManager.h"
#include "platform/files/PathText.h"

#include <array>
#include <cerrno>
#include <cstdio>
#include <fcntl.h>
#include <sys/random.h>
#include <sys/stat.h>

namespace platform {
namespace {

/// Names beside the target begin so: hidden, and short enough beside a name of any length.
constexpr std::string_view temporaryPrefix = ".tavrin-write-";

std::string temporaryPath(std::string_view folder) {
    std::uint64_t number = 0;
    if (::getrandom(&number, sizeof number, 0) != sizeof number)
        number = static_cast<std::uint64_t>(::getpid()) << 32U;
    std::array<char, 17> text{};
    std::snprintf(text.data(), text.size(), "%016llx", static_cast<unsigned long long>(number));
    std::string path(folder);
    if (path != "/")
        path += '/';
    return path.append(temporaryPrefix).append(text.data());
}

int writeAll(int file, std::string_view content) {
    while (!content.empty()) {
        const ssize_t put = ::write(file, content.data(), content.size());
        if (put < 0 && errno != EINTR)
            return errno;
        content.remove_prefix(static_cast<std::size_t>(put < 0 ? 0 : put));
    }
    return 0;
}

int writeAndSync(FileDescriptor file, std::string_view content, Durable durable) {
    if (const int number = writeAll(file.get(), content))
        return number;
    if (durable == Durable::yes && ::fsync(file.get()) != 0)
        return errno;
    return ::close(file.release()) == 0 ? 0 : errno;
}

/// Writes and syncs a new file at `temporary`, then gives it its name. Leaves no file on failure.
int writeAndRename(const std::string& temporary, const PathText& target, std::string_view content,
                   std::uint32_t mode, Durable durable) {
    FileDescriptor file(::open(temporary.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC,
                               static_cast<mode_t>(mode)));
    if (!file)
        return errno;
    int number = writeAndSync(std::move(file), content, durable);
    if (number == 0 && std::rename(temporary.c_str(), target.c_str()) != 0)
        number = errno;
    if (number != 0)
        ::unlink(temporary.c_str());
    return number;
}

/// Makes the rename durable. File systems that cannot sync a folder say EINVAL; theirs is.
int syncFolder(std::string_view folder) {
    const FileDescriptor opened(
        ::open(PathText(folder).c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
    if (!opened)
        return errno == EACCES ? 0 : errno; // a folder that may be written to but not read
    return ::fsync(opened.get()) == 0 || errno == EINVAL || errno == EROFS ? 0 : errno;
}

} // namespace

Failure FileManager::writeAtomically(const Url& file, std::string_view content, std::uint32_t mode,
                                     Durable durable) {
    const PathText target(file.path());
    if (*target.c_str() == '\0')
        return posixError(ENOENT, file, true);
    const std::string_view folder = folderOf(file.path());
    int number = writeAndRename(temporaryPath(folder), target, content, mode, durable);
    if (number == 0 && durable == Durable::yes)
        number = syncFolder(folder);
    return number == 0 ? std::nullopt : Failure(posixError(number, file, true));
}

} // namespace platform
