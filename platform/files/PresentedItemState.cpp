#include "platform/files/PresentedItemState.h"

#include "platform/files/ContentProviderSlot.h"
#include "platform/files/PathText.h"

#include <array>
#include <climits>
#include <fcntl.h>
#include <sys/stat.h>

namespace platform {
namespace {

/// The places that the desktop's trash uses: "Trash/files" in the data folder, and ".Trash/1000" or
/// ".Trash-1000" at the top of other disks.
bool liesInTrash(std::string_view path) {
    return path.find("/Trash/files/") != std::string_view::npos ||
           path.find("/.Trash-") != std::string_view::npos ||
           path.find("/.Trash/") != std::string_view::npos;
}

} // namespace

PresentedItemState PresentedItemState::read(const std::string& path) {
    PresentedItemState state;
    if (Result<FileAttributes> found = FileManager::attributes(path, FollowLinks::no)) {
        state.presence = Presence::present;
        state.attributes = *std::move(found);
    } else if (ContentProviderSlot::shared().isPromised(Url::file(path))) {
        state.presence = Presence::promised;
    }
    return state;
}

bool PresentedItemState::operator==(const PresentedItemState& other) const {
    const FileAttributes& a = attributes;
    const FileAttributes& b = other.attributes;
    return presence == other.presence && a.identity == b.identity && a.size == b.size &&
           a.modified == b.modified && a.changed == b.changed;
}

ItemHandle::ItemHandle(const std::string& path)
    : item_(::open(PathText(path).c_str(), O_PATH | O_NOFOLLOW | O_CLOEXEC)) {
}

std::optional<std::string> ItemHandle::currentPath() const {
    struct stat held {};
    if (!item_ || ::fstat(item_.get(), &held) != 0 || held.st_nlink == 0)
        return std::nullopt;
    std::array<char, PATH_MAX> buffer; // NOLINT: readlink() fills it
    const std::string link = "/proc/self/fd/" + std::to_string(item_.get());
    const ssize_t length = ::readlink(link.c_str(), buffer.data(), buffer.size());
    if (length <= 0 || length == static_cast<ssize_t>(buffer.size()))
        return std::nullopt;
    std::string path(buffer.data(), static_cast<std::size_t>(length));
    // The system's answer is text: make sure that the item is there.
    struct stat found {};
    if (::lstat(path.c_str(), &found) != 0 || found.st_ino != held.st_ino ||
        found.st_dev != held.st_dev || liesInTrash(path))
        return std::nullopt;
    return path;
}

} // namespace platform
