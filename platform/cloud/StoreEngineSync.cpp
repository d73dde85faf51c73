#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/cloud/KeptFolder.h"
#include "platform/cloud/StoreEngine.h"
#include "platform/cloud/SyncTimes.h"

#include <algorithm>

namespace platform {
namespace {

/// After a look because of a notice the engine rests for so many times as long as it took, at most
/// so long: in a folder of a hundred thousand files one that is written to all the time would
/// otherwise keep the processor busy.
constexpr std::int64_t restFactor = 2;
constexpr Duration longestRest = std::chrono::seconds(10);

/// How often a command waits until what is being written to may be read.
constexpr int settlingAtMost = 5;

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

/// What a command says that has waited long enough.
Error stillChanging(const std::string& file) {
    if (file.empty())
        return makeErrorWithText(
            ErrorCode::changedWhileRead,
            localized("Documents are being changed without a pause. What is new will be on your "
                      "account some moments after that has ended."));
    return makeErrorWithText(
        ErrorCode::changedWhileRead,
        localizedFormat("“%1$@” is being written to without a pause. It will be on your account "
                        "some moments after that has ended.",
                        file));
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
    if (alarm == Alarm::notice)
        delay = std::clamp<Duration>(nextLook_ - services_.clock.monotonic(), delay, longestRest);
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
        failure = synchronize(request).failure;
    if (!failure || concernsWholeStore(*failure))
        setProblem(failure);
}

Synchronizer::Report StoreEngine::synchronize(const Synchronizer::Request& request) {
    const std::shared_ptr<Synchronizer> synchronizer = this->synchronizer();
    if (!synchronizer) {
        Synchronizer::Report closed;
        closed.failure = notOpen();
        return closed;
    }
    const Synchronizer::Report report = synchronizer->run(request);
    if (!report.allFolders) {
        const std::lock_guard lock(mutex_);
        nextLook_ = services_.clock.monotonic() + report.looked * restFactor;
    }
    if (report.failure && report.failure->is(ErrorCode::serverNotAvailable)) {
        connected_ = false;
        followed_ = false;
    }
    plan(report);
    return report;
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
    bool news = false;
    {
        const std::lock_guard lock(mutex_);
        news = question_ != report.question || waiting_ != report.waiting;
        question_ = report.question;
        waiting_ = report.waiting;
    }
    if (news)
        services_.conditionChanged();
    if (!report.folders.empty())
        watchFolders(report.folders, report.allFolders);
    watchRemote();
    const Synchronizer::Request disk{false, false, {}, false, false};
    if (report.settlesIn)
        wantAfter(Alarm::settle, *report.settlesIn, disk);
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

void StoreEngine::noticed(const std::string& folder) {
    if (const std::shared_ptr<Synchronizer> synchronizer = this->synchronizer())
        synchronizer->changedOnDisk(folder);
    wantAfter(Alarm::notice, noticeDelay, {false, false, {}, false, false});
}

void StoreEngine::rewatch(const std::string& folder) {
    std::erase_if(localWatches_, [&](const auto& watch) {
        return folder.empty() || watch.first == folder || watch.first.starts_with(folder + '/');
    });
    noticed(folder);
}

void StoreEngine::watchFolders(const std::vector<std::string>& folders, bool all) {
    std::map<std::string, DirectoryWatcher::Token> before = std::exchange(localWatches_, {});
    if (!all)
        localWatches_.swap(before);
    for (const std::string& folder : folders) {
        DirectoryWatcher::Token& token = localWatches_[folder];
        if (const auto found = before.find(folder); found != before.end())
            token = std::move(found->second);
        if (token)
            continue;
        token = services_.watcher.watch(
            Url::file(layout_.root() + (folder.empty() ? "" : "/" + folder), true), *queue_,
            [this, folder](const std::vector<DirectoryChange>& changes) {
                for (const DirectoryChange& change : changes)
                    if (change.kind == DirectoryChange::Kind::folderGone)
                        listing_->async([this, folder] { rewatch(folder); });
                noticed(folder);
            });
        if (token) // what came between the look and the watch
            noticed(folder);
    }
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
    syncNow(std::move(done), settlingAtMost);
}

void StoreEngine::syncNow(Done done, int times) {
    listing_->async([this, done = std::move(done), times] {
        queue_->sync([] {}); // an opening that is under way comes first
        Failure failure = transfers() ? followRemote() : Failure(notOpen());
        std::optional<Duration> settlesIn;
        std::string youngFile;
        if (transfers() && (!failure || !concernsWholeStore(*failure))) {
            const Synchronizer::Report report = synchronize({true, true, {}, true, false});
            failure = report.failure ? report.failure : report.unreadable;
            settlesIn = report.question ? std::nullopt : report.settlesIn;
            youngFile = report.youngFile;
        }
        if (transfers() && (!failure || concernsWholeStore(*failure)))
            setProblem(failure);
        if (!failure && settlesIn && times > 0) {
            services_.clock.setAlarm(*settlesIn, [weak = weak_from_this(), done, times] {
                if (const std::shared_ptr<StoreEngine> self = weak.lock())
                    self->syncNow(done, times - 1);
                else if (done)
                    done(makeError(ErrorCode::userCancelled));
            });
        } else if (done) {
            done(failure || !settlesIn ? failure : stillChanging(youngFile));
        }
    });
}

void StoreEngine::setMetered(bool metered) {
    if (metered_.exchange(metered) == metered)
        return;
    if (const std::shared_ptr<Synchronizer> synchronizer = this->synchronizer())
        synchronizer->setMetered(metered);
    if (!metered) // what has waited goes now
        want({false, true, {}, false, false});
}

std::vector<PendingWork> StoreEngine::waitingForNetwork() const {
    const std::shared_ptr<Synchronizer> synchronizer = this->synchronizer();
    return synchronizer ? synchronizer->waitingForNetwork() : std::vector<PendingWork>();
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
