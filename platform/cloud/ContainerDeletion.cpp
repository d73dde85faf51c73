#include "platform/cloud/ContainerDeletion.h"

#include "platform/base/Log.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/cloud/StoreRemovals.h"
#include "platform/files/FileCoordinator.h"

namespace platform {

Failure ContainerDeletion::run(const std::string& folder) {
    std::optional<ItemId> item;
    std::optional<std::string> remotePath;
    context_.queue.sync([&] {
        item = context_.database.itemAtPath(folder);
        if (item)
            remotePath = context_.database.remotePathOf(*item);
    });
    if (remotePath) {
        const Result<RemoteEntry> entry = context_.remote.entry(*remotePath, cancel_);
        if (!entry && !entry.error().is(ErrorCode::noSuchItem))
            return entry.error();
        if (entry) {
            found_.push_back({*remotePath, *entry});
            if (Failure failure = readRemote(*remotePath))
                return failure;
        }
    }
    if (Failure failure = removeHere(folder))
        return failure;
    if (Failure failure = removeThere())
        return failure;
    if (!item || found_.empty())
        return std::nullopt;
    return context_.remote.sync(cancel_);
}

Failure ContainerDeletion::readRemote(const std::string& path) {
    const Result<RemoteListing> listing = context_.remote.list(path, cancel_);
    if (!listing)
        return listing.error();
    for (const RemoteEntry& entry : listing->entries) {
        const std::string inner = path + '/' + entry.name;
        found_.push_back({inner, entry});
        if (entry.kind == ItemKind::folder)
            if (Failure failure = readRemote(inner))
                return failure;
    }
    return std::nullopt;
}

Failure ContainerDeletion::removeHere(const std::string& folder) {
    FileCoordinator coordinator;
    Failure removing;
    Failure refused = coordinator.coordinateWriting(
        Url::file(context_.pathOf(folder), true), WritingOptions::forDeleting, [&](const Url&) {
            context_.queue.sync([&] { removing = StoreRemovals(context_).remove(folder); });
        });
    return refused ? refused : removing;
}

Failure ContainerDeletion::removeThere() {
    Failure first;
    for (auto found = found_.rbegin(); found != found_.rend(); ++found) {
        const bool folder = found->entry.kind == ItemKind::folder;
        const Failure failure = context_.remote.remove(
            found->path, found->entry.kind, folder ? std::string() : found->entry.etag, cancel_);
        if (!failure || failure->is(ErrorCode::noSuchItem))
            continue;
        platformLog(LogLevel::warning, "cloud: cannot delete “%@” on the account: %@", found->path,
                    *failure);
        // A folder that is not empty only tells once more that something in it has stayed.
        if (!first || first->is(ErrorCode::folderNotEmpty))
            first = failure;
        if (failure->is(ErrorCode::serverNotAvailable) || failure->is(ErrorCode::userCancelled))
            return first;
    }
    return first;
}

} // namespace platform
