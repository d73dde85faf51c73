#include "platform/files/FileDescriptor.h"
#include "platform/files/FileListing.h"
#include "platform/files/FileManager.h"
#include "platform/files/PathText.h"

#include <cerrno>
#include <fcntl.h>
#include <sys/stat.h>

namespace platform {
namespace {

/// Folders of a tree that are kept open at once; deeper trees reopen the outer ones on the way
/// back.
constexpr std::size_t openFolderLimit = 64;
/// How often a folder is listed anew when somebody fills it while it is being emptied.
constexpr int passLimit = 8;

/// Which folder an open descriptor is, and on which mounted disk.
struct FolderIdentity {
    std::uint64_t inode = 0;
    std::uint32_t deviceMajor = 0;
    std::uint32_t deviceMinor = 0;
    std::uint64_t mount = 0;

    bool sameFolder(const FolderIdentity& other) const {
        return inode == other.inode && deviceMajor == other.deviceMajor &&
               deviceMinor == other.deviceMinor;
    }
};

int identify(int folder, FolderIdentity& out) {
    struct statx info {};
    if (::statx(folder, "", AT_EMPTY_PATH, STATX_INO | STATX_MNT_ID, &info) != 0)
        return errno;
    out = {info.stx_ino, info.stx_dev_major, info.stx_dev_minor, 0};
    // Kernels that do not tell the mount leave the device, which tells most of them apart.
    out.mount = (info.stx_mask & STATX_MNT_ID) != 0
                    ? info.stx_mnt_id
                    : (std::uint64_t{info.stx_dev_major} << 32U | info.stx_dev_minor);
    return 0;
}

int unlinkEntry(int folder, const std::string& name, int flags) {
    if (::unlinkat(folder, name.c_str(), flags) == 0 || errno == ENOENT)
        return 0; // what somebody else removed is gone as well
    return errno;
}

/// Empties one folder and removes it. Every step is relative to an open folder and none follows a
/// link, so that swapping a folder for a link meanwhile cannot lead out of the tree; other mounted
/// disks are not entered.
class TreeRemover {
public:
    TreeRemover(int parent, std::string_view parentPath, std::uint64_t mount)
        : parent_(parent), parentPath_(parentPath), mount_(mount) {}

    Failure remove(const std::string& name) {
        int number = enter(name);
        while (number == 0 && !levels_.empty())
            number = step();
        return number == 0 ? std::nullopt : Failure(writeError(number, failedPath()));
    }

private:
    struct Level {
        std::string name;
        FileDescriptor folder;
        FolderIdentity identity;
        std::vector<DirectoryEntry> entries;
        std::size_t next = 0;
        int passes = 0;
    };

    int parentOfTop() const { return levels_.size() < 2 ? parent_ : above().folder.get(); }
    const Level& above() const { return levels_[levels_.size() - 2]; }

    int list(Level& level) {
        level.entries.clear();
        level.next = 0;
        ++level.passes;
        if (::lseek(level.folder.get(), 0, SEEK_SET) != 0)
            return errno;
        return listOpenFolder(level.folder.get(), [&level](const DirectoryEntry& entry) {
            level.entries.push_back(entry);
            return true;
        });
    }

    /// Opens the folder of that name in the innermost level and makes it the innermost.
    int enter(const std::string& name) {
        failed_ = name;
        const int outer = levels_.empty() ? parent_ : levels_.back().folder.get();
        Level level;
        level.name = name;
        level.folder = FileDescriptor(
            ::openat(outer, name.c_str(), O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC));
        if (!level.folder) {
            const int number = errno;
            // No folder any more: somebody put something else in its place.
            const bool swapped = number == ENOTDIR || number == ELOOP;
            return swapped || number == ENOENT ? unlinkEntry(outer, name, 0) : number;
        }
        if (const int number = identify(level.folder.get(), level.identity))
            return number;
        if (level.identity.mount != mount_)
            return EBUSY;
        if (const int number = list(level))
            return number;
        if (levels_.size() >= openFolderLimit)
            levels_[levels_.size() - openFolderLimit].folder.reset();
        levels_.push_back(std::move(level));
        return 0;
    }

    int step() {
        Level& level = levels_.back();
        if (level.next == level.entries.size())
            return leave();
        const DirectoryEntry entry = std::move(level.entries[level.next++]);
        if (entry.kind == FileKind::directory)
            return enter(entry.name);
        failed_ = entry.name;
        const int number = unlinkEntry(level.folder.get(), entry.name, 0);
        return number == EISDIR ? enter(entry.name) : number;
    }

    /// Removes the innermost folder, which is empty unless somebody filled it meanwhile.
    int leave() {
        failed_.clear();
        if (const int number = reopenAbove())
            return number;
        Level& level = levels_.back();
        int number = unlinkEntry(parentOfTop(), level.name, AT_REMOVEDIR);
        if ((number == ENOTEMPTY || number == EEXIST) && level.passes < passLimit)
            return list(level);
        if (number == ENOTDIR)
            number = unlinkEntry(parentOfTop(), level.name, 0);
        if (number == 0)
            levels_.pop_back();
        return number;
    }

    /// Opens the folder above the innermost one again, by way of "..", and makes sure that it is
    /// still the one that was left: the tree may have been moved meanwhile.
    int reopenAbove() {
        if (levels_.size() < 2 || above().folder)
            return 0;
        FileDescriptor folder(::openat(levels_.back().folder.get(), "..",
                                       O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC));
        if (!folder)
            return errno;
        FolderIdentity identity;
        if (const int number = identify(folder.get(), identity))
            return number;
        if (!identity.sameFolder(above().identity))
            return EBUSY;
        levels_[levels_.size() - 2].folder = std::move(folder);
        return 0;
    }

    std::string failedPath() const {
        std::string path = parentPath_ == "/" ? std::string() : std::string(parentPath_);
        for (const Level& level : levels_)
            path += '/' + level.name;
        return failed_.empty() ? path : path + '/' + failed_;
    }

    int parent_;
    std::string_view parentPath_;
    std::uint64_t mount_;
    std::vector<Level> levels_;
    /// The entry of the innermost level at which a failure happens; "" for that level itself.
    std::string failed_;
};

} // namespace

Failure FileManager::removeItem(const Url& item) {
    const std::string name(nameOf(item.path()));
    if (name.empty() || name == "." || name == ".." || name.find('\0') != std::string::npos)
        return posixError(EINVAL, item, true);
    const std::string_view parentPath = folderOf(item.path());
    const FileDescriptor parent(
        ::open(PathText(parentPath).c_str(), O_PATH | O_DIRECTORY | O_CLOEXEC));
    if (!parent)
        return posixError(errno, item, true);
    if (::unlinkat(parent.get(), name.c_str(), 0) == 0)
        return std::nullopt;
    if (errno != EISDIR)
        return posixError(errno, item, true);
    FolderIdentity identity;
    if (const int number = identify(parent.get(), identity))
        return posixError(number, item, true);
    return TreeRemover(parent.get(), parentPath, identity.mount).remove(name);
}

} // namespace platform
