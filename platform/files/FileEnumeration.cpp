#include "platform/files/FileDescriptor.h"
#include "platform/files/FileListing.h"
#include "platform/files/FileManager.h"
#include "platform/files/PathText.h"

#include <cerrno>
#include <dirent.h>
#include <fcntl.h>
#include <memory>

namespace platform {
namespace {

/// One system call's worth of entries: a few thousand names.
constexpr std::size_t bufferSize = 256UL * 1024;

FileKind kindOfEntryType(unsigned char type) {
    switch (type) {
    case DT_REG:
        return FileKind::file;
    case DT_DIR:
        return FileKind::directory;
    case DT_LNK:
        return FileKind::symbolicLink;
    default:
        return FileKind::other;
    }
}

bool isDotOrDotDot(const char* name) {
    return name[0] == '.' && (name[1] == '\0' || (name[1] == '.' && name[2] == '\0'));
}

} // namespace

int listOpenFolder(int folder, const std::function<bool(const DirectoryEntry&)>& take) {
    const auto buffer = std::make_unique_for_overwrite<char[]>(bufferSize);
    DirectoryEntry entry;
    for (;;) {
        const ssize_t length = ::getdents64(folder, buffer.get(), bufferSize);
        if (length <= 0)
            return length == 0 ? 0 : errno;
        for (ssize_t at = 0; at < length;) {
            const auto* raw = reinterpret_cast<const dirent64*>(buffer.get() + at);
            at += raw->d_reclen;
            if (isDotOrDotDot(raw->d_name))
                continue;
            entry.name.assign(raw->d_name);
            entry.kind = kindOfEntryType(raw->d_type);
            if (!take(entry))
                return 0;
        }
    }
}

Failure FileManager::enumerate(std::string_view path,
                               const std::function<bool(const DirectoryEntry&)>& take) {
    const FileDescriptor folder(::open(PathText(path).c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
    if (!folder)
        return readError(errno, path);
    if (const int number = listOpenFolder(folder.get(), take))
        return readError(number, path);
    return std::nullopt;
}

Result<std::vector<DirectoryEntry>> FileManager::entries(std::string_view path) {
    std::vector<DirectoryEntry> found;
    if (Failure failure = enumerate(path, [&found](const DirectoryEntry& entry) {
            found.push_back(entry);
            return true;
        }))
        return std::move(*failure);
    return found;
}

} // namespace platform
