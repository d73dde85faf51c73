#include "platform/cloud/webdav/WebDavTrash.h"

#include "platform/base/Log.h"
#include "platform/cloud/Remote.h"
#include "platform/cloud/SyncNames.h"
#include "platform/cloud/Tokens.h"
#include "platform/files/PathText.h"

namespace platform {
namespace {

constexpr double trashKeptSeconds = 31.0 * 24 * 3600;
constexpr double incomingSeconds = 24.0 * 3600;
constexpr int placesTried = 3;

std::string hiddenFolder(std::string_view name) {
    return std::string(remoteServiceFolder) + '/' + std::string(name);
}

bool isFolderThere(const HttpResult& made) {
    return made.isGood() || (made.ok() && made.reply.status == 405);
}

} // namespace

HttpResult WebDavTrash::makeFolders(const std::string& folder, CancelFlag& cancel) {
    {
        const std::lock_guard lock(mutex_);
        if (made_.contains(folder))
            return {{}, {}, HttpReply{201, {}, {}}};
    }
    HttpResult result = server_.makeFolder(folder, cancel);
    if (result.ok() && !isFolderThere(result) && folder.find('/') != std::string::npos) {
        result = makeFolders(std::string(folderOf(folder)), cancel);
        if (result.ok() && isFolderThere(result))
            result = server_.makeFolder(folder, cancel);
    }
    if (isFolderThere(result)) {
        result.reply.status = 201;
        const std::lock_guard lock(mutex_);
        made_.insert(folder);
    }
    return result;
}

void WebDavTrash::forget(const std::string& folder) {
    const std::lock_guard lock(mutex_);
    std::erase_if(made_, [&](const std::string& made) { return folder.starts_with(made); });
}

WebDavTrash::Taken WebDavTrash::take(const std::string& path, bool isFolder, CancelFlag& cancel) {
    const std::string day = hiddenFolder("trash/") + dayText(server_.now()) + '/';
    Taken taken;
    for (int attempt = 0; attempt < placesTried; ++attempt) {
        // Replaced more than once a day; or a file of the trash has the name of a folder; or a
        // folder's name has been made there already, for what was in it.
        const bool plain = attempt == 0 && !isFolder;
        const std::string mark = plain ? std::string() : '~' + hexText(randomBytes(4));
        const std::string name(cutAtCharacter(nameOf(path), 200));
        const bool flat = attempt == placesTried - 1 || path.find('/') == std::string::npos;
        taken.place = day + (flat ? std::string() : std::string(folderOf(path)) + '/') +
                      (plain ? std::string(nameOf(path)) : name + mark);
        const std::string folder(folderOf(taken.place));
        {
            const std::lock_guard one(making_);
            taken.result = makeFolders(folder, cancel);
        }
        if (taken.result.isGood())
            taken.result = server_.move(path, taken.place, isFolder, cancel);
        if (!taken.result.ok() || taken.result.isMade())
            return taken;
        forget(folder); // it may have been emptied by another device
    }
    return taken;
}

HttpResult WebDavTrash::incoming(std::string& place, CancelFlag& cancel) {
    const std::string folder = hiddenFolder("incoming");
    place = folder + '/' + hexText(randomBytes(12));
    const std::lock_guard one(making_);
    return makeFolders(folder, cancel);
}

void WebDavTrash::expire(CancelFlag& cancel) {
    expireIn(hiddenFolder("trash"), true, cancel);
    expireIn(hiddenFolder("incoming"), false, cancel);
}

void WebDavTrash::expireIn(const std::string& folder, bool days, CancelFlag& cancel) {
    struct Old {
        std::string path;
        bool isFolder;
    };
    std::vector<Old> old;
    const Date now = server_.now();
    const HttpResult listed = server_.properties(
        folder, true, 1,
        [&](const DavItem& item) -> Failure {
            const std::optional<std::string> path = pathOfHref(item.href);
            const std::string name(path ? nameOf(*path) : std::string_view());
            const std::optional<Date> since =
                days ? dateOfText(name) : dateOfHttpText(item.modified);
            if (since && !name.empty() && name != nameOf(folder) && item.isCollection == days &&
                now.secondsSince(*since) > (days ? trashKeptSeconds : incomingSeconds))
                old.push_back({folder + '/' + name, item.isCollection});
            return std::nullopt;
        },
        cancel);
    if (!listed.isGood())
        return;
    for (const Old& each : old)
        if (!server_.erase(each.path, each.isFolder, cancel).isGood())
            platformLog(LogLevel::warning, "cloud: cannot empty the server's “%@”", folder);
    for (const Old& each : old)
        forget(each.path);
}

} // namespace platform
