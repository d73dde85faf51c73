#include "platform/cloud/RemoteTrash.h"

#include "platform/base/Log.h"
#include "platform/cloud/SyncNames.h"
#include "platform/cloud/Tokens.h"
#include "platform/files/PathText.h"

#include <cerrno>
#include <fcntl.h>

namespace platform {
namespace {

constexpr auto kept = std::chrono::hours(24 * 30);
constexpr int namesTried = 3;

} // namespace

std::string RemoteTrash::placeFor(const std::string& itemPath, int attempt) const {
    const std::string day = folder_ + "/trash/" + dayText(clock_.now()) + '/';
    if (attempt == 0)
        return day + itemPath;
    // Replaced more than once a day; or a file of the trash has the name of a folder of the path.
    const std::string mark = '~' + hexText(randomBytes(4));
    const std::string name(cutAtCharacter(nameOf(itemPath), longestItemName - mark.size()));
    const bool flat = attempt == namesTried || itemPath.find('/') == std::string::npos;
    return day + (flat ? "" : std::string(folderOf(itemPath)) + '/') + name + mark;
}

/// Tries the places one after the other; `arrive` answers none when it worked.
template<class Arrive>
Result<std::string> RemoteTrash::findPlace(const std::string& itemPath,
                                           const Arrive& arrive) const {
    for (int attempt = 0;; ++attempt) {
        std::string place = placeFor(itemPath, attempt);
        Failure failure = arrive(place);
        if (failure && failure->is(ErrorCode::noSuchItem)) {
            failure = FileManager::createDirectory(Url::file(folderOf(place), true), true);
            if (!failure)
                failure = arrive(place);
        }
        if (!failure)
            return place;
        if (attempt == namesTried ||
            (!failure->is(ErrorCode::fileExists) && !failure->is(ErrorCode::noSuchItem)))
            return *failure;
    }
}

Result<RemoteTrash::Opened> RemoteTrash::open(const std::string& itemPath) const {
    FileDescriptor file;
    const Result<std::string> place = findPlace(itemPath, [&](const std::string& path) -> Failure {
        file = FileDescriptor(
            ::open(path.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, 0666));
        return file ? Failure() : posixError(errno, Url::file(path), true);
    });
    if (!place)
        return place.error();
    return Opened{std::move(file), *place};
}

Result<std::string> RemoteTrash::take(const std::string& from, const std::string& itemPath) const {
    return findPlace(itemPath, [&](const std::string& place) {
        return FileManager::moveItem(Url::file(from), Url::file(place));
    });
}

void RemoteTrash::expire() const {
    const std::string trash = folder_ + "/trash";
    const Result<std::vector<DirectoryEntry>> days = FileManager::entries(trash);
    if (!days)
        return;
    for (const DirectoryEntry& day : *days) {
        const std::optional<Date> date = dateOfText(day.name);
        if (!date || clock_.now().secondsSince(*date) <
                         std::chrono::duration<double>(kept + std::chrono::hours(24)).count())
            continue;
        if (const Failure failure =
                FileManager::removeItem(Url::file(trash + '/' + day.name, true)))
            platformLog(LogLevel::warning, "cloud: cannot empty the remote's trash: %@", *failure);
    }
}

} // namespace platform
