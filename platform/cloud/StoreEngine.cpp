#include "platform/cloud/StoreEngine.h"

#include "platform/base/Identity.h"
#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/cloud/AttributeReading.h"
#include "platform/cloud/KeptFolder.h"
#include "platform/cloud/StoreFileSystem.h"

#include <cstdlib>
#include <functional>
#include <limits.h>

namespace platform {
namespace {

std::string queueLabel(std::string_view end) {
    return std::string(applicationIdentifier) + std::string(end);
}

std::string canonicalPath(const std::string& path) {
    const std::unique_ptr<char, decltype(&std::free)> real(realpath(path.c_str(), nullptr),
                                                           &std::free);
    return real ? std::string(real.get()) : path;
}

std::uint64_t seedOf(const AccountRecord& account) {
    return std::hash<std::string>{}(account.address);
}

} // namespace

StoreEngine::StoreEngine(const Services& services, const AccountRecord& account,
                         std::unique_ptr<Remote> remote)
    : services_(services),
      account_(account),
      layout_(StoreLayout::of(services.folders, account)),
      remote_(std::move(remote)),
      values_(layout_.values(), services.disk, services.clock, services.valuesChanged),
      backoff_(seedOf(account)),
      queue_(std::make_unique<WorkQueue>(queueLabel(".cloud"), WorkPriority::userInitiated)),
      listing_(std::make_unique<WorkQueue>(queueLabel(".cloud.listing"), WorkPriority::standard)),
      exchanging_(
          std::make_unique<WorkQueue>(queueLabel(".cloud.values"), WorkPriority::standard)) {
    view_.containers = std::make_shared<const ContainerSet>();
    view_.roles = std::make_shared<const SharedRoles>();
}

StoreEngine::~StoreEngine() {
    stop();
}

void StoreEngine::stop() {
    cancel_.cancel();
    std::shared_ptr<Transfers> transfers;
    {
        const std::lock_guard lock(mutex_);
        transfers = std::move(transfers_);
        services_.clock.cancelAlarm(retry_);
        for (const auto& [alarm, pending] : alarms_)
            services_.clock.cancelAlarm(pending.id);
        alarms_.clear();
        if (synchronizer_)
            synchronizer_->cancel();
    }
    if (transfers)
        transfers->stop(); // while the queue that their last steps need has the store
    {
        std::unique_lock lock(mutex_);
        unused_.wait(lock, [this] { return uses_ == 0; });
    }
    listing_->sync([this] {
        localWatches_.clear();
        remoteWatches_.clear();
    });
    queue_->sync([this] {
        {
            const std::lock_guard lock(mutex_);
            synchronizer_.reset();
        }
        valuesWatch_.reset();
        rootWatch_.reset();
        containerWatches_.clear();
        values_.close();
        context_.reset();
        view_.reader.reset(); // the last connection to close puts the database in order
        store_.reset();
    });
    exchanging_->sync([] {});
}

void StoreEngine::open(bool readOnly) {
    queue_->sync([&] {
        if (readOnly)
            openForReading();
        else
            openForChanges();
    });
}

void StoreEngine::openForChanges() {
    if (cancel_.isCancelled())
        return;
    Result<OpenedStore> store = openStore(layout_, services_.disk, services_.clock);
    if (store) {
        begin(std::move(*store));
        return;
    }
    platformLog(LogLevel::error, "cloud: cannot open the store: %@", store.error());
    const Error problem = namedForPeople(store.error(), layout_.folder);
    const bool passing = problem.is(ErrorCode::itemBusy) || problem.is(ErrorCode::outOfSpace) ||
                         problem.is(ErrorCode::writeNoPermission) ||
                         problem.is(ErrorCode::readOnlyVolume);
    if (passing) {
        openForReading();
        retryLater([](StoreEngine& engine) { engine.openForChanges(); });
    }
    setProblem(problem);
}

void StoreEngine::openForReading() {
    const std::optional<std::string> mark = readRootMark(layout_);
    if (!mark) {
        setProblem(makeErrorWithText(ErrorCode::databaseUnusable,
                                     localized("The store has not been set up yet.")));
        return;
    }
    view_.root = layout_.root();
    view_.canonicalRoot = canonicalPath(view_.root);
    view_.mark = *mark;
    if (Result<std::shared_ptr<StateReader>> reader = StateReader::open(layout_.database()))
        view_.reader = std::move(*reader);
    else
        setProblem(reader.error());
    if (view_.reader) {
        const bool complete = view_.reader->ask([](StateQueries& queries) {
            return queries.scan(rootItem, Side::remote).complete &&
                   queries.unfinishedScans(Side::remote).empty();
        });
        const std::lock_guard lock(mutex_);
        listed_ = complete;
    }
    readContainers();
    {
        const std::lock_guard lock(mutex_);
        usable_ = true;
    }
    services_.conditionChanged();
}

void StoreEngine::begin(OpenedStore store) {
    setProblem(std::nullopt);
    {
        const std::lock_guard lock(mutex_);
        notice_ = store.notice;
    }
    store_.emplace(std::move(store));
    context_.emplace(StoreContext{layout_, store_->mark, services_.disk, *remote_, services_.clock,
                                  *queue_, *store_->database, &services_.activity});
    Transfers::recover(*context_);
    // The user's own library is there from the first moment, also before the remote was seen.
    if (const Failure failure =
            services_.disk.makeFolder(layout_.root() + '/' + std::string(defaultContainerFolder));
        failure && !failure->is(ErrorCode::fileExists))
        platformLog(LogLevel::warning, "cloud: cannot make the default container: %@", *failure);
    openForReading();
    readRoles();
    publish();
    values_.open();
    {
        auto transfers = std::make_shared<Transfers>(
            *context_, services_.progress, account_.rateLimit.value_or(0), [this](ItemId) {
                readRoles();
                publish();
            });
        auto synchronizer = std::make_shared<Synchronizer>(
            *context_, transfers->queue(), transfers->limiter(), cancel_, store_->lock.afterCrash(),
            [this](const ListingBatch& batch) { written(batch); });
        synchronizer->setMetered(metered_);
        KeptFolder(*context_).expire();
        const std::lock_guard lock(mutex_);
        transfers_ = std::move(transfers);
        synchronizer_ = std::move(synchronizer);
    }
    watchContainers();
    listing_->async([this] { setProblem(followRemote()); });
}

void StoreEngine::readContainers() {
    view_.containers = ContainerSet::read(view_.root);
    publish();
}

void StoreEngine::watchContainers() {
    const auto again = [this] {
        readContainers();
        watchContainers();
    };
    if (!rootWatch_) {
        rootWatch_ = services_.watcher.watch(Url::file(view_.root, true), *queue_,
                                             [again](const auto&) { again(); });
        readContainers(); // what came before the watch
    }
    std::map<std::string, DirectoryWatcher::Token> watches;
    bool fresh = false;
    for (const ContainerSet::Entry& entry : view_.containers->entries()) {
        DirectoryWatcher::Token& token = watches[entry.folder];
        if (const auto found = containerWatches_.find(entry.folder);
            found != containerWatches_.end())
            token = std::move(found->second);
        if (token)
            continue;
        token = services_.watcher.watch(
            Url::file(view_.root + '/' + entry.folder, true), *queue_,
            [this, again, folder = entry.folder](const std::vector<DirectoryChange>& changes) {
                for (const DirectoryChange& change : changes) {
                    if (change.kind == DirectoryChange::Kind::folderGone)
                        containerWatches_.erase(folder); // another one may have its name
                    if (change.name == containerFileName || change.name.empty()) {
                        again();
                        return;
                    }
                }
            });
        fresh = true;
    }
    containerWatches_ = std::move(watches);
    if (fresh) // a description may have come between the reading and the watch
        readContainers();
}

void StoreEngine::readRoles() {
    auto roles = std::make_shared<SharedRoles>();
    for (const ItemState& state : store_->database->sharedItems())
        if (!state.local->promise)
            roles->emplace(state.local->identity, state.remote->role);
    view_.roles = std::move(roles);
}

void StoreEngine::publish() {
    services_.slot.store(std::make_shared<const StoreView>(view_));
}

bool StoreEngine::usable() const {
    const std::lock_guard lock(mutex_);
    return usable_;
}

bool StoreEngine::isListed() const {
    const std::lock_guard lock(mutex_);
    return listed_;
}

std::optional<std::string> StoreEngine::problem() const {
    const std::lock_guard lock(mutex_);
    if (problem_)
        return problem_->localizedDescription;
    if (question_)
        return textOf(*question_);
    return notice_;
}

std::optional<DeletionQuestion> StoreEngine::question() const {
    const std::lock_guard lock(mutex_);
    return question_;
}

void StoreEngine::setProblem(const Failure& failure) {
    if (failure && failure->is(ErrorCode::userCancelled))
        return;
    if (failure && failure->is(ErrorCode::readCorrupt) && store_)
        store_->lock.keepCrashMark();
    {
        const std::lock_guard lock(mutex_);
        problem_ = failure;
    }
    services_.conditionChanged();
}

std::shared_ptr<Transfers> StoreEngine::transfers() const {
    const std::lock_guard lock(mutex_);
    return transfers_;
}

Error StoreEngine::notOpen() const {
    const std::lock_guard lock(mutex_);
    return problem_.value_or(makeErrorWithText(
        ErrorCode::itemBusy, localized("The store cannot be changed now.")));
}

void StoreEngine::retryLater(std::function<void(StoreEngine&)> job) {
    const std::lock_guard lock(mutex_);
    services_.clock.cancelAlarm(retry_);
    retry_ =
        services_.clock.setAlarm(backoff_.next(), [weak = weak_from_this(), job = std::move(job)] {
            if (const std::shared_ptr<StoreEngine> self = weak.lock())
                self->queue_->async([engine = self.get(), job] { job(*engine); });
        });
}

Failure StoreEngine::makeLocal(const Url& item, CancelFlag& cancel) {
    const std::shared_ptr<Transfers> transfers = this->transfers();
    if (!transfers)
        return notOpen();
    bool directory = false;
    if (!FileManager::exists(item.path(), &directory))
        return fetch(*transfers, item, cancel);
    if (!directory)
        return std::nullopt;
    // A package: a folder that people see as one document.
    const auto view = services_.slot.load();
    const Result<std::vector<DirectoryEntry>> entries = FileManager::entries(item.path());
    if (!entries)
        return entries.error();
    for (const DirectoryEntry& entry : *entries) {
        const std::string path = item.path() + '/' + entry.name;
        Failure failure;
        if (entry.kind == FileKind::directory)
            failure = makeLocal(Url::file(path, true), cancel);
        else if (const auto mark =
                     hasSidecarForm(entry.name) && view ? readMark(path, view->mark) : std::nullopt)
            failure = fetch(*transfers, item.appending(promisedName(entry.name, *mark)), cancel);
        if (failure)
            return failure;
    }
    return std::nullopt;
}

Failure StoreEngine::fetch(Transfers& transfers, const Url& item, CancelFlag& cancel) {
    return withRemote([&] { return transfers.fetch(item, cancel); });
}

} // namespace platform
