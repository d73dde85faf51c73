#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/cloud/ContainerDeletion.h"
#include "platform/cloud/Eviction.h"
#include "platform/cloud/StoreEngine.h"
#include "platform/cloud/StoreMoves.h"
#include "platform/cloud/StoreRemovals.h"
#include "platform/cloud/SyncTimes.h"

namespace platform {

std::shared_ptr<void> StoreEngine::use() {
    const std::lock_guard lock(mutex_);
    if (!transfers_)
        return nullptr;
    ++uses_;
    return std::shared_ptr<void>(this, [this](void*) {
        const std::lock_guard inner(mutex_);
        --uses_;
        unused_.notify_all();
    });
}

Failure StoreEngine::withRemote(const std::function<Failure()>& work) {
    if (Failure failure = connect())
        return failure;
    Failure failure = work();
    if (!failure || !failure->is(ErrorCode::serverNotAvailable))
        return failure;
    // A disk that was away and came back is the same by its mark alone.
    connected_ = false;
    if (Failure away = connect())
        return away;
    return work();
}

void StoreEngine::changedByUser() {
    readRoles();
    publish();
    // What the user did is written down already.
    wantAfter(Alarm::notice, noticeDelay, {false, false, {}, false, false});
}

Failure StoreEngine::moveItem(const Url& from, const Url& to) {
    const auto view = services_.slot.load();
    const std::optional<std::string_view> source =
        view ? view->relative(from.path()) : std::optional<std::string_view>();
    if (source && StoreRemovals::isFixed(*source))
        return makeErrorWithText(
            ErrorCode::unsupportedOperation,
            localizedFormat("“%1$@” belongs to the store itself and cannot be moved.",
                            from.lastPathComponent()));
    const std::shared_ptr<void> open = use();
    if (!open)
        return notOpen();
    Result<StoreMoves::Moved> moved = StoreMoves(*context_).moveOnDisk(from, to);
    if (!moved)
        return moved.error();
    bool isFirst = false;
    {
        const std::lock_guard lock(mutex_);
        isFirst = moved_.empty();
        moved_.push_back(std::move(*moved));
    }
    // Many moves in a row are written down together: a record each would take its time from the
    // user, who waits.
    if (isFirst)
        queue_->async([this] { recordMoves(); });
    return std::nullopt;
}

void StoreEngine::recordMoves() {
    std::vector<StoreMoves::Moved> moves;
    {
        const std::lock_guard lock(mutex_);
        moves.swap(moved_);
    }
    if (!context_)
        return; // the disk tells the next one who opens the store
    if (const Failure failure = StoreMoves(*context_).record(moves)) {
        platformLog(LogLevel::warning, "cloud: moves are not written down, and looked for: %@",
                    *failure);
        wantAfter(Alarm::notice, noticeDelay, {false, true, {}, false, false});
    }
    changedByUser();
}

Failure StoreEngine::removeItem(const Url& item) {
    Failure failure;
    queue_->sync([&] {
        const std::optional<std::string_view> relative = view_.relative(item.path());
        if (!relative)
            failure = makeError(ErrorCode::noSuchItem, item.lastPathComponent());
        else
            failure = context_ ? StoreRemovals(*context_).remove(std::string(*relative))
                               : Failure(notOpen());
        if (!failure)
            changedByUser();
    });
    return failure;
}

Failure StoreEngine::evictItem(const Url& item) {
    const std::shared_ptr<void> open = use();
    if (!open)
        return notOpen();
    const auto view = services_.slot.load();
    const std::optional<std::string_view> relative =
        view ? view->relative(item.path()) : std::optional<std::string_view>();
    if (!relative || relative->empty())
        return makeError(ErrorCode::noSuchItem, item.lastPathComponent());
    Failure failure =
        withRemote([&] { return Eviction(*context_, cancel_).evict(std::string(*relative)); });
    if (!failure)
        queue_->sync([this] { changedByUser(); });
    return failure;
}

Failure StoreEngine::deleteContainer(const CloudContainer& container) {
    const std::shared_ptr<void> open = use();
    if (!open)
        return notOpen();
    if (container.isDefault())
        return makeErrorWithText(
            ErrorCode::unsupportedOperation,
            localizedFormat("“%1$@” belongs to the store itself and cannot be deleted.",
                            container.localizedName()));
    std::optional<std::string> folder;
    if (const auto view = services_.slot.load())
        for (const ContainerSet::Entry& entry : view->containers->entries())
            if (entry.container->identifier() == container.identifier())
                folder = entry.folder;
    if (!folder)
        return makeError(ErrorCode::noSuchItem, container.localizedName());
    Failure failure =
        withRemote([&] { return ContainerDeletion(*context_, cancel_).run(*folder); });
    queue_->sync([this] {
        changedByUser();
        readContainers();
    });
    return failure;
}

void StoreEngine::exchangeValues() {
    exchanging_->async([this] {
        const std::shared_ptr<void> open = use();
        if (!open)
            return;
        const Failure failure = withRemote([&] { return values_.exchange(*remote_, cancel_); });
        if (failure && !failure->is(ErrorCode::userCancelled))
            platformLog(LogLevel::warning,
                        "cloud: cannot bring the account's values up to date: %@", *failure);
    });
}

void StoreEngine::watchValues() {
    const std::optional<std::string> folder = remote_->watchableFolder();
    if (valuesWatch_ || !folder)
        return;
    valuesWatch_ = services_.watcher.watch(
        Url::file(*folder + '/' + std::string(remoteServiceFolder), true), *queue_,
        [this](const std::vector<DirectoryChange>& changes) {
            for (const DirectoryChange& change : changes) {
                if (change.kind == DirectoryChange::Kind::folderGone)
                    valuesWatch_.reset();
                if (change.name.empty() ||
                    KeyValueSync::remotePath().ends_with('/' + change.name)) {
                    exchangeValues();
                    return;
                }
            }
        });
}

} // namespace platform
