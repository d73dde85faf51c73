#include "platform/documents/preview/OfficeCache.h"

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>
#include <vector>

namespace platform {
namespace {

/// Some hundred documents of the usual size; beyond that making them anew costs less than keeping.
constexpr std::uint64_t mostCachedBytes = 200'000'000;
/// A preview of this age has been forgotten by a program that is gone.
constexpr double longestPreview = 2 * 24 * 3600.0;
constexpr std::string_view workPrefix = "work-";

} // namespace

std::string OfficeCache::pathFor(const FileAttributes& document) const {
    std::string name;
    for (const std::uint64_t part :
         {document.identity.device, document.identity.inode,
          static_cast<std::uint64_t>(document.identity.birthNanoseconds),
          static_cast<std::uint64_t>(document.modified.nanoseconds), document.size}) {
        char digits[20];
        std::snprintf(digits, sizeof digits, "%llx-", static_cast<unsigned long long>(part));
        name += digits;
    }
    name.back() = '.';
    return folder_ + '/' + name + "pdf";
}

bool OfficeCache::has(const std::string& path) const {
    return ::utimensat(AT_FDCWD, path.c_str(), nullptr, AT_SYMLINK_NOFOLLOW) == 0;
}

Failure OfficeCache::put(const std::string& made, const std::string& path) const {
    if (::rename(made.c_str(), path.c_str()) != 0)
        return posixError(errno, Url::file(path), true);
    trim();
    return std::nullopt;
}

void OfficeCache::remove(const std::string& path) const {
    ::unlink(path.c_str());
}

Failure OfficeCache::makeFolder(const std::string& path) const {
    if (Failure failure = FileManager::createDirectory(Url::file(path, true), true))
        return failure;
    // What is in a document is nobody else's business.
    ::chmod(path.c_str(), 0700);
    return std::nullopt;
}

Result<std::string> OfficeCache::makeWorkFolder() const {
    if (Failure failure = makeFolder(folder_))
        return *failure;
    removeLeftFolders();
    std::string path = folder_ + '/' + std::string(workPrefix) + "XXXXXX";
    if (!::mkdtemp(path.data()))
        return posixError(errno, Url::file(folder_), true);
    return path;
}

void OfficeCache::trim() const {
    struct Kept {
        Date used;
        std::uint64_t size;
        std::string path;
    };
    std::vector<Kept> kept;
    std::uint64_t total = 0;
    (void)FileManager::enumerate(folder_, [&](const DirectoryEntry& entry) {
        const std::string path = folder_ + '/' + entry.name;
        const auto attributes = FileManager::attributes(path, FollowLinks::no);
        if (entry.name.ends_with(".pdf") && attributes && attributes->kind == FileKind::file) {
            kept.push_back({attributes->modified, attributes->size, path});
            total += attributes->size;
        }
        return true;
    });
    std::sort(kept.begin(), kept.end(),
              [](const Kept& a, const Kept& b) { return a.used < b.used; });
    for (const Kept& each : kept) {
        if (total <= mostCachedBytes)
            return;
        remove(each.path);
        total -= each.size;
    }
}

void OfficeCache::removeLeftFolders() const {
    const Date now = Date::fromParts(std::time(nullptr), 0); // the files' clock
    std::vector<std::string> left;
    (void)FileManager::enumerate(folder_, [&](const DirectoryEntry& entry) {
        const std::string path = folder_ + '/' + entry.name;
        const auto attributes = FileManager::attributes(path, FollowLinks::no);
        if (entry.name.starts_with(workPrefix) && attributes &&
            now.secondsSince(attributes->modified) > longestPreview)
            left.push_back(path);
        return true;
    });
    for (const std::string& path : left)
        (void)FileManager::removeItem(Url::file(path, true));
}

} // namespace platform
