#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/cloud/KeptFolder.h"
#include "platform/cloud/StoreEngine.h"
#include "platform/cloud/SyncTimes.h"

#include <algorithm>

namespace platform {
namespace {

/// Both wishes in one.
void merge(Synchronizer::Request& into, const Synchronizer::Request& other) {
    into.commanded = into.commanded || other.commanded;
    into.lookAtDisk = into.lookAtDisk || other.lookAtDisk;
    into.everything = into.everything || other.everything;
    into.lookAgain = into.lookAgain || other.lookAgain;
    for (const ItemId folder : other.folders)
        if (std::find(into.folders.begin(), into.folders.end(), folder) == into.folders.end())
            into.folders.push_back(folder);
}

} // namespace

std::shared_ptr<Synchronizer> StoreEngine::synchronizer() const {
    const std::lock_guard lock(mutex_);
    return transfers_ ? synchronizer_ : nullptr;
}

void StoreEngine::want(const Synchronizer::Request& wanted) {
    {
        const std::lock_guard lock(mutex_);
        if (!transfers_)
            return;
        if (wanted_) { // what is waiting to run does this as well
            merge(*wanted_, wanted);
            return;
        }
        wanted_ = wanted;
    }
    listing_->async([this] { runWanted(); });
}

void StoreEngine::wantAfter(Alarm alarm, Duration delay, const Synchronizer::Request& wanted) {
    const std::lock_guard lock(mutex_);
    if (!transfers_)
        return;
    Pending& pending = alarms_[alarm];
    if (alarm == Alarm::notice && pending.id != 0) { // the first of many notices has set it
        merge(pending.request, wanted);
        return;
    }
    services_.clock.cancelAlarm(pending.id);
    pending.request = wanted;
    pending.id = services_.clock.setAlarm(delay, [weak = weak_from_this(), alarm] {
        const std::shared_ptr<StoreEngine> self = weak.lock();
        if (!self)
            return;
        Synchronizer::Request request;
        {
            const std::lock_guard inner(self->mutex_);
            request = std::exchange(self->alarms_[alarm], {}).request;
        }
        self->want(request);
    });
}

void StoreEngine::runWanted() {
    Synchronizer::Request request;
    {
        const std::lock_guard lock(mutex_);
        request = *std::exchange(wanted_, std::nullopt);
    }
    if (cancel_.isCancelled())
        return;
    Failure failure = followRemote();
    if (!failure || !concernsWholeStore(*failure))
        failure = synchronize(request);
    if (!failure || concernsWholeStore(*failure))
        setProblem(failure);
}

Failure StoreEngine::synchronize(const Synchronizer::Request& request) {
    const std::shared_ptr<Synchronizer> synchronizer = this->synchronizer();
    if (!synchronizer)
        return notOpen();
    const Synchronizer::Report report = synchronizer->run(request);
    if (report.failure && report.failure->is(ErrorCode::serverNotAvailable)) {
        connected_ = false;
        followed_ = false;
    }
    plan(report);
    return report.failure;
}

/// What comes after a run.
void StoreEngine::plan(const Synchronizer::Report& report) {
    if (cancel_.isCancelled())
        return;
    queue_->sync([&] {
        if (!context_)
            return;
        readRoles();
        if (report.changes > 0)
            readContainers();
        else
            publish();
    });
    {
        const std::lock_guard lock(mutex_);
        question_ = report.question;
    }
    if (!report.folders.empty())
        watchFolders(report.folders);
    watchRemote();
    const Synchronizer::Request disk{false, true, {}, false, false};
    if (report.unsettled)
        wantAfter(Alarm::settle, coarseSettleTime, disk);
    if (report.secondLook)
        wantAfter(Alarm::secondLook, secondLookDelay, {false, false, {}, false, true});
    if (report.retryAt)
        wantAfter(Alarm::retry,
                  std::max<Duration>(
                      Duration(report.retryAt->nanoseconds - services_.clock.now().nanoseconds),
                      settleTime),
                  disk);
    if (!remote_->watchableFolder())
        wantAfter(Alarm::poll, pollInterval, {false, false, {}, true, false});
    wantAfter(Alarm::sweep, sweepInterval, {false, true, {}, true, false});
    if (report.failure && !report.failure->is(ErrorCode::userCancelled))
        retryLater([](StoreEngine& engine) { engine.want({false, true, {}, true, false}); });
}

void StoreEngine::watchFolders(const std::vector<std::string>& folders) {
    std::map<std::string, DirectoryWatcher::Token> watches;
    bool fresh = false;
    for (const std::string& folder : folders) {
        DirectoryWatcher::Token& token = watches[folder];
        if (const auto found = localWatches_.find(folder); found != localWatches_.end())
            token = std::move(found->second);
        if (token)
            continue;
        fresh = true;
        token = services_.watcher.watch(
            Url::file(layout_.root() + (folder.empty() ? "" : "/" + folder), true), *queue_,
            [this, folder](const std::vector<DirectoryChange>& changes) {
                for (const DirectoryChange& change : changes)
                    if (change.kind == DirectoryChange::Kind::folderGone)
                        listing_->async([this, folder] { localWatches_.erase(folder); });
                wantAfter(Alarm::notice, noticeDelay, {false, true, {}, false, false});
            });
    }
    localWatches_ = std::move(watches);
    if (fresh) // what came between the look and the watch
        wantAfter(Alarm::notice, noticeDelay, {false, true, {}, false, false});
}

void StoreEngine::watchRemote() {
    const std::optional<std::string> root = remote_->watchableFolder();
    if (!root)
        return;
    std::vector<std::pair<ItemId, std::string>> folders;
    queue_->sync([&] {
        if (context_)
            folders = context_->database.remoteFolders();
    });
    std::map<ItemId, std::pair<std::string, DirectoryWatcher::Token>> watches;
    for (auto& [item, path] : folders) {
        auto& watch = watches[item];
        if (const auto found = remoteWatches_.find(item);
            found != remoteWatches_.end() && found->second.first == path)
            watch = std::move(found->second);
        if (watch.second)
            continue;
        watch = {
            path,
            services_.watcher.watch(
                Url::file(path.empty() ? *root : *root + '/' + path, true), *queue_,
                [this, folder = item](const std::vector<DirectoryChange>&) {
                    wantAfter(Alarm::notice, noticeDelay, {false, false, {folder}, false, false});
                })};
    }
    remoteWatches_ = std::move(watches);
}

void StoreEngine::sync(Done done) {
    listing_->async([this, done = std::move(done)] {
        queue_->sync([] {}); // an opening that is under way comes first
        Failure failure = transfers() ? followRemote() : Failure(notOpen());
        if (transfers() && (!failure || !concernsWholeStore(*failure)))
            failure = synchronize({true, true, {}, true, false});
        if (transfers() && (!failure || concernsWholeStore(*failure)))
            setProblem(failure);
        if (done)
            done(failure);
    });
}

Failure StoreEngine::answer(DeletionAnswer answer) {
    const std::shared_ptr<void> open = use();
    const std::shared_ptr<Synchronizer> synchronizer = this->synchronizer();
    if (!open || !synchronizer)
        return notOpen();
    Failure failure;
    queue_->sync([&] { failure = synchronizer->answer(answer); });
    if (!failure)
        want({true, true, {}, true, false});
    return failure;
}

} // namespace platform
