#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/cloud/RemoteLister.h"
#include "platform/cloud/StoreEngine.h"

#include <algorithm>
#include <array>

namespace platform {
namespace {

/// Whether the batch may have changed which containers there are.
bool touchesTop(const ListingBatch& batch) {
    return std::any_of(batch.changes.begin(), batch.changes.end(), [](const auto& change) {
        return change.item.place && (change.item.place->parent == rootItem ||
                                     change.item.place->name == containerFileName);
    });
}

} // namespace

bool StoreEngine::concernsWholeStore(const Error& error) {
    constexpr std::array codes{ErrorCode::serverNotAvailable, ErrorCode::authenticationFailed,
                               ErrorCode::outOfSpace,         ErrorCode::readOnlyVolume,
                               ErrorCode::databaseUnusable,   ErrorCode::readCorrupt,
                               ErrorCode::userCancelled};
    return std::any_of(codes.begin(), codes.end(), [&](ErrorCode code) { return error.is(code); });
}

Failure StoreEngine::checkRemoteMark(const std::string& mark) {
    Failure failure;
    queue_->sync([&] {
        if (!context_) { // stopped meanwhile
            failure = makeError(ErrorCode::userCancelled);
            return;
        }
        StateDatabase& database = context_->database;
        const std::string linked = database.meta("remote");
        if (linked == mark)
            return;
        if (linked.empty()) {
            failure = database.transaction([&]() -> Failure {
                database.setMeta("remote", mark);
                database.putScan(rootItem, Side::remote, {0, false});
                return std::nullopt;
            });
            return;
        }
        failure = makeErrorWithText(
            ErrorCode::serverNotAvailable,
            localizedFormat("What is at “%1$@” now is not what this account was linked with. "
                            "Connect the right disk, or sign in to another folder.",
                            account_.address));
    });
    return failure;
}

Failure StoreEngine::connect() {
    const std::lock_guard lock(connecting_);
    if (connected_)
        return std::nullopt;
    const Result<std::string> mark = remote_->connect(cancel_);
    const Failure failure = mark ? checkRemoteMark(*mark) : Failure(mark.error());
    connected_ = !failure;
    return failure;
}

void StoreEngine::written(const ListingBatch& batch) {
    readRoles();
    if (touchesTop(batch))
        readContainers();
    else
        publish();
}

Failure StoreEngine::list(const std::vector<ItemId>& folders, bool everything) {
    RemoteLister lister(*context_, cancel_, [this](const ListingBatch& batch) { written(batch); });
    const Failure failure = lister.run(folders, everything ? RemoteLister::Depth::everything
                                                           : RemoteLister::Depth::newFolders);
    if (failure && failure->is(ErrorCode::serverNotAvailable))
        connected_ = false;
    return failure;
}

/// Connects, and ends a first listing that has not come to its end. What fails is tried again.
Failure StoreEngine::followRemote() {
    if (cancel_.isCancelled()) // stopped: there may be no store any more
        return makeError(ErrorCode::userCancelled);
    Failure failure = connect();
    bool allListed = false;
    if (!failure) {
        std::vector<ItemId> unfinished;
        queue_->sync([&] {
            unfinished = context_->database.unfinishedScans(Side::remote);
            watchValues();
        });
        exchangeValues();
        if (!unfinished.empty())
            failure = list(unfinished, false);
        // From the root on nothing was known: all of it was read a moment ago.
        allListed = std::find(unfinished.begin(), unfinished.end(), rootItem) != unfinished.end();
    }
    if (!failure || !concernsWholeStore(*failure)) {
        const std::lock_guard lock(mutex_);
        listed_ = true;
    }
    if (!failure) {
        {
            const std::lock_guard lock(mutex_);
            backoff_.reset();
        }
        if (!std::exchange(followed_, true))
            want({false, true, {}, !allListed, false});
        return std::nullopt;
    }
    if (failure->is(ErrorCode::userCancelled))
        return failure;
    if (failure->is(ErrorCode::serverNotAvailable))
        followed_ = false; // what happens there until it is back is heard of by nobody
    platformLog(LogLevel::warning, "cloud: cannot read the account: %@", *failure);
    retryLater([](StoreEngine& engine) {
        engine.listing_->async([&engine] { engine.setProblem(engine.followRemote()); });
    });
    return failure;
}

void StoreEngine::refresh(const std::optional<Url>& folder, Done done) {
    listing_->async([this, folder, done = std::move(done)] {
        queue_->sync([] {}); // an opening that is under way comes first
        Failure failure = transfers() ? refreshNow(folder) : Failure(notOpen());
        if (transfers() && (!failure || concernsWholeStore(*failure)))
            setProblem(failure);
        if (done)
            done(failure);
    });
}

Failure StoreEngine::refreshNow(const std::optional<Url>& folder) {
    if (Failure failure = followRemote(); failure && concernsWholeStore(*failure))
        return failure;
    std::optional<ItemId> item = rootItem;
    if (folder)
        queue_->sync([&] {
            const std::optional<std::string_view> path = view_.relative(folder->path());
            item = path ? context_->database.itemAtPath(*path) : std::nullopt;
        });
    if (!item)
        return makeError(ErrorCode::noSuchItem, folder->lastPathComponent());
    return synchronize({false, !folder, folder ? std::vector{*item} : std::vector<ItemId>{},
                        !folder, false})
        .failure;
}

void StoreEngine::freeBytes(std::function<void(const Result<std::uint64_t>&)> done) {
    listing_->async([this, done = std::move(done)] {
        if (!transfers()) {
            done(notOpen());
            return;
        }
        if (const Failure failure = connect()) {
            done(*failure);
            return;
        }
        const Result<std::optional<std::uint64_t>> free = remote_->freeBytes(cancel_);
        if (!free) {
            done(free.error());
            return;
        }
        std::uint64_t bytes = free->value_or(0);
        if (account_.quota) {
            std::int64_t used = 0;
            queue_->sync([&] { used = context_->database.counts().bytes; });
            const std::uint64_t left =
                *account_.quota - std::min(*account_.quota, static_cast<std::uint64_t>(used));
            bytes = *free ? std::min(bytes, left) : left;
        } else if (!*free) {
            done(makeErrorWithText(ErrorCode::unsupportedOperation,
                                   localized("The account does not tell how much room is left.")));
            return;
        }
        done(bytes);
    });
}

} // namespace platform
