#include "platform/cloud/CloudService.h"

#include "platform/base/Log.h"
#include "platform/base/NotificationCenter.h"
#include "platform/base/Text.h"
#include "platform/cloud/AccountMonitor.h"
#include "platform/cloud/AccountPasswords.h"
#include "platform/cloud/KeyValueCloudStore.h"
#include "platform/cloud/StandardRemotes.h"
#include "platform/cloud/StoreDocuments.h"
#include "platform/cloud/StoreEngine.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/cloud/TransferActivity.h"

#include <atomic>
#include <mutex>

namespace platform {

std::optional<IdentityToken> IdentityToken::deserialized(const Bytes& bytes) {
    return bytes.empty() ? std::nullopt : std::optional(IdentityToken(bytes));
}

/// The engine changes with the account; whoever works with it holds it as long as that takes.
struct CloudService::State final : CloudAccountService,
                                   ContentProvider,
                                   CloudDatabase,
                                   KeyValueCloudStore,
                                   std::enable_shared_from_this<CloudService::State> {
    explicit State(Parts given)
        : parts(std::move(given)), documents(slot, [this] { return current(); }) {
        if (!parts.disk)
            parts.disk = makeRealStoreFileSystem();
        if (!parts.remotes)
            parts.remotes =
                standardRemotes(parts.clock, [this](const AccountRecord& account, bool refused) {
                    return passwords.credentials(account, refused);
                });
        activity.setListener([this] { tellOfActivity(); });
    }

    // CloudAccountService
    std::optional<IdentityToken> identityToken() const override {
        const std::lock_guard lock(mutex);
        if (!reading.account || !engine || !engine->usable())
            return std::nullopt;
        return IdentityToken(reading.account->identity);
    }
    std::optional<AccountSummary> account() const override {
        const std::lock_guard lock(mutex);
        if (!reading.account)
            return std::nullopt;
        return AccountSummary{reading.account->name, reading.account->kind,
                              reading.account->address};
    }
    std::optional<std::string> problem() const override {
        const std::lock_guard lock(mutex);
        if (reading.problem || unsupported)
            return reading.problem ? reading.problem : unsupported;
        return engine ? engine->problem() : std::nullopt;
    }

    // ContentProvider
    bool isPromised(const Url& item) const override { return documents.isPromised(item); }
    Failure makeLocal(const Url& item, CancelFlag& cancel) override {
        const std::shared_ptr<StoreEngine> held = current();
        return held ? held->makeLocal(item, cancel) : Failure(makeError(ErrorCode::noAccount));
    }
    Failure moveItem(const Url& from, const Url& to) override {
        return documents.moveItem(from, to);
    }

    // KeyValueCloudStore
    Value value(std::string_view key) const override {
        const std::shared_ptr<StoreEngine> held = current();
        return held ? held->values().value(key) : Value();
    }
    void setValue(std::string_view key, Value value) override {
        const std::shared_ptr<StoreEngine> held = current();
        if (!held) {
            platformLog(LogLevel::warning, "cloud: “%@” is not kept: nobody is signed in", key);
            return;
        }
        if (const Failure failure = held->values().setValue(key, std::move(value)))
            platformLog(LogLevel::error, "cloud: cannot keep “%@” on the disk: %@", key, *failure);
        held->exchangeValues();
    }
    void tellOfValues() {
        parts.main.async([&notifications = parts.notifications] {
            notifications.post(keyValueStoreDidChangeExternallyNotification);
        });
    }

    void tellOfAccount() {
        told = identityToken();
        parts.notifications.post(cloudIdentityDidChangeNotification);
    }
    /// A store that could not be opened at first makes an account of one that was none.
    void tellOfCondition() {
        parts.main.async([weak = weak_from_this()] {
            const std::shared_ptr<State> self = weak.lock();
            if (!self)
                return;
            if (self->identityToken() != self->told)
                self->tellOfAccount();
            self->parts.notifications.post(cloudProblemDidChangeNotification);
        });
    }

    // CloudDatabase
    void addOperation(std::shared_ptr<QuotaOperation> operation) override {
        const auto answer = [operation](const Result<std::uint64_t>& bytes) {
            if (operation->completion)
                operation->completion(bytes);
        };
        if (const std::shared_ptr<StoreEngine> held = current())
            held->freeBytes(answer);
        else
            answer(makeError(ErrorCode::noAccount));
    }

    /// One notice for all that changes until it is given.
    void tellOfActivity() {
        if (activityTold.exchange(true))
            return;
        parts.main.async([weak = weak_from_this()] {
            const std::shared_ptr<State> self = weak.lock();
            if (!self)
                return;
            self->activityTold = false;
            self->parts.notifications.post(cloudActivityDidChangeNotification);
        });
    }

    std::shared_ptr<StoreEngine> current() const {
        const std::lock_guard lock(mutex);
        return engine;
    }

    /// Puts the store of the account that the file names in place of the one before.
    void follow(const AccountReading& now) {
        std::shared_ptr<StoreEngine> former;
        {
            const std::lock_guard lock(mutex);
            former = std::move(engine);
            engine.reset();
            reading = now;
            unsupported.reset();
        }
        slot.store(nullptr);
        if (former)
            former->stop();  // gives its lock back before the next one asks for its own
        slot.store(nullptr); // the last steps of what ran may have shown themselves
        if (!now.account)
            return;
        std::unique_ptr<Remote> remote = parts.remotes(*now.account);
        if (!remote) {
            const std::lock_guard lock(mutex);
            unsupported = localizedFormat("This version cannot use accounts of the kind “%1$@” "
                                          "yet. Update the program or sign in to a folder.",
                                          now.account->kind);
            platformLog(LogLevel::warning, "cloud: no account: %@", *unsupported);
            return;
        }
        const StoreEngine::Services services{parts.clock,
                                             parts.watcher,
                                             parts.progress,
                                             parts.folders,
                                             *parts.disk,
                                             slot,
                                             activity,
                                             [this] { tellOfValues(); },
                                             [this] { tellOfCondition(); }};
        auto next = std::make_shared<StoreEngine>(services, *now.account, std::move(remote));
        next->setMetered(metered);
        next->open(parts.readOnly);
        const std::lock_guard lock(mutex);
        engine = std::move(next);
    }

    Parts parts;
    TransferActivity activity;
    AccountPasswords passwords{parts.secrets ? parts.secrets : makeSecretStore(parts.folders),
                               [this] { tellOfCondition(); }};
    std::atomic<bool> activityTold{false};
    bool metered = false; // main thread
    StoreViewSlot slot;
    StoreDocuments documents;
    mutable std::mutex mutex;
    AccountReading reading;                 // guarded by mutex, as are the two below
    std::optional<std::string> unsupported; // the kind of the account, and what to do
    std::shared_ptr<StoreEngine> engine;
    std::unique_ptr<AccountMonitor> monitor;
    std::optional<IdentityToken> told; // what the last notice was about; main thread
};

CloudService::CloudService(Parts parts) : state_(std::make_shared<State>(std::move(parts))) {
    State& state = *state_;
    state.monitor = std::make_unique<AccountMonitor>(
        state.parts.folders, state.parts.main, state.parts.watcher, [&state] {
            state.follow(state.monitor->reading());
            state.tellOfAccount();
            state.parts.notifications.post(cloudProblemDidChangeNotification);
            state.tellOfValues(); // those of another account
        });
    state.follow(state.monitor->reading());
    state.told = state.identityToken();
}

CloudService::~CloudService() {
    state_->monitor.reset();
    state_->follow({});
}

CloudAccountService& CloudService::accounts() {
    return *state_;
}

CloudDocumentService& CloudService::documents() {
    return state_->documents;
}

ContentProvider& CloudService::contents() {
    return *state_;
}

KeyValueCloudStore& CloudService::keyValues() {
    return *state_;
}

CloudDatabase& CloudService::database() {
    return *state_;
}

void CloudService::refresh(const std::optional<Url>& folder,
                           std::function<void(const Failure& failure)> done) {
    if (const std::shared_ptr<StoreEngine> engine = state_->current())
        engine->refresh(folder, std::move(done));
    else if (done)
        done(makeError(ErrorCode::noAccount));
}

void CloudService::sync(std::function<void(const Failure& failure)> done) {
    state_->passwords.tryAgain();
    if (const std::shared_ptr<StoreEngine> engine = state_->current())
        engine->sync(std::move(done));
    else if (done)
        done(makeError(ErrorCode::noAccount));
}

std::optional<DeletionQuestion> CloudService::question() const {
    const std::shared_ptr<StoreEngine> engine = state_->current();
    return engine ? engine->question() : std::nullopt;
}

Failure CloudService::answer(DeletionAnswer answer) {
    const std::shared_ptr<StoreEngine> engine = state_->current();
    return engine ? engine->answer(answer) : Failure(makeError(ErrorCode::noAccount));
}

std::vector<PendingWork> CloudService::pending() const {
    const std::shared_ptr<const StoreView> view = state_->slot.load();
    if (!view || !view->reader)
        return {};
    std::vector<PendingWork> work = view->reader->ask(&Synchronizer::pending);
    if (const std::shared_ptr<StoreEngine> engine = state_->current())
        for (PendingWork& waiting : engine->waitingForNetwork())
            work.push_back(std::move(waiting));
    return work;
}

std::vector<RefusedRow> CloudService::refusedNames(std::size_t atMost) const {
    const std::shared_ptr<const StoreView> view = state_->slot.load();
    if (!view || !view->reader)
        return {};
    return view->reader->ask([atMost](StateQueries& queries) {
        return queries.refusedPaths(atMost);
    });
}

std::vector<TransferInfo> CloudService::transfers() const {
    return state_->activity.now();
}

void CloudService::setMetered(bool metered) {
    state_->metered = metered;
    if (const std::shared_ptr<StoreEngine> engine = state_->current())
        engine->setMetered(metered);
}

std::optional<std::string> CloudService::passwordWanted() const {
    std::optional<AccountRecord> account;
    {
        const std::lock_guard lock(state_->mutex);
        account = state_->reading.account;
    }
    return account ? state_->passwords.whyWanted(*account) : std::nullopt;
}

SecretStore& CloudService::secrets() {
    return state_->passwords.secrets();
}

void CloudService::readAccountFile() {
    state_->monitor->look();
}

std::vector<std::string> CloudService::conflicts() const {
    constexpr std::size_t atMost = 10000;
    const std::shared_ptr<const StoreView> view = state_->slot.load();
    if (!view || !view->reader)
        return {};
    return view->reader->ask([](StateQueries& queries) {
        std::vector<std::string> paths;
        for (const ItemId item : queries.itemsNamed(" (conflict ", atMost))
            if (const std::optional<std::string> path = queries.pathOf(item))
                paths.push_back(*path);
        return paths;
    });
}

std::optional<CloudStatus> CloudService::status() const {
    const std::shared_ptr<StoreEngine> engine = state_->current();
    const std::shared_ptr<const StoreView> view = state_->slot.load();
    if (!engine || !view || !view->reader)
        return std::nullopt;
    const StoreCounts counts =
        view->reader->ask([](StateQueries& queries) { return queries.counts(); });
    return CloudStatus{engine->layout().folder, engine->isListed(),
                       counts.folders,          counts.files,
                       counts.promises,         counts.bytes,
                       counts.refused,          view->reader->ask(&Synchronizer::question)};
}

} // namespace platform
