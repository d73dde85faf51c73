#pragma once

#include "platform/base/Result.h"
#include "platform/base/Value.h"

#include <cstdint>
#include <functional>
#include <string>
#include <string_view>
#include <vector>

namespace platform {

/// What an item is by its device, inode and birth time: an inode number alone is used again at
/// once after a deletion. A birth time of 0 means that the file system reports none.
struct FileIdentity {
    std::uint64_t device = 0;
    std::uint64_t inode = 0;
    std::int64_t birthNanoseconds = 0;
    auto operator<=>(const FileIdentity&) const = default;
};

enum class FileKind { file, directory, symbolicLink, other };

struct FileAttributes {
    FileKind kind = FileKind::file;
    std::uint64_t size = 0;
    /// Date{} when the file system reports no birth time.
    Date created;
    Date modified;
    /// Time of the last change of content or attributes (ctime).
    Date changed;
    FileIdentity identity;
    std::uint64_t links = 1;
    std::uint32_t mode = 0;
};

struct DirectoryEntry {
    std::string name;
    /// `other` when the file system does not tell without a stat.
    FileKind kind = FileKind::other;
};

enum class FollowLinks { no, yes };
enum class Durable { no, yes };

/// The file system, one call a step. Every operation is synchronous, safe from any thread, and says
/// in its error which item failed and why. Nothing here coordinates; see FileCoordinator.
class FileManager {
public:
    /// True when anything but a dangling link stands there; `isDirectory` tells which.
    static bool exists(std::string_view path, bool* isDirectory = nullptr);
    static Result<FileAttributes> attributes(std::string_view path, FollowLinks follow);
    /// The folder's entries without "." and "..", in the file system's order.
    static Result<std::vector<DirectoryEntry>> entries(std::string_view path);
    /// The same without keeping them: `take` answers false to stop.
    static Failure enumerate(std::string_view path,
                             const std::function<bool(const DirectoryEntry&)>& take);

    /// Makes the folder, with missing parents when `intermediates`. An existing folder is success
    /// then, and fileExists otherwise.
    static Failure createDirectory(const Url& folder, bool intermediates);
    /// Removes a file, a link, or a folder with its contents. Stops at the first failure. Follows
    /// no link and enters no other mounted disk (itemBusy).
    static Failure removeItem(const Url& item);
    /// Renames without ever replacing: fileExists when something stands at `to`. On another file
    /// system it answers unsupportedOperation with errno EXDEV's reason.
    static Failure moveItem(const Url& from, const Url& to);
    /// Swaps two items of one file system at once.
    static Failure exchangeItems(const Url& a, const Url& b);
    /// Copies one file's content and times into a new file; removes the copy when that fails, also
    /// when the file changed meanwhile (changedWhileRead).
    static Failure copyFile(const Url& from, const Url& to);

    /// The first `limit` bytes, or all when the file is shorter. Regular files only; never waits.
    static Result<Bytes> contents(const Url& file, std::uint64_t limit);
    /// Writes beside the target, syncs, renames over it, syncs the folder: after a crash either the
    /// old content or the whole new one is there. Without syncing, others still see either; after a
    /// crash it may be damaged, which is enough for what can be made again.
    static Failure writeAtomically(const Url& file, std::string_view content,
                                   std::uint32_t mode = 0644, Durable durable = Durable::yes);

    /// Free bytes of the file system that holds the path, as an unprivileged user may use them.
    static Result<std::uint64_t> freeBytes(std::string_view path);
};

/// One extended attribute ("user.xdg.tags"): none when absent or unsupported.
std::optional<std::string> extendedAttribute(std::string_view path, const char* name,
                                             FollowLinks follow = FollowLinks::yes);
Failure setExtendedAttribute(const Url& item, const char* name, std::string_view value);
Failure removeExtendedAttribute(const Url& item, const char* name);

} // namespace platform
