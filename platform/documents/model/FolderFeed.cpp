#include "platform/documents/model/FolderFeed.h"

#include "platform/base/MainQueue.h"
#include "platform/base/WorkQueue.h"
#include "platform/documents/model/NameOrder.h"
#include "platform/files/FileManager.h"

#include <algorithm>
#include <iterator>
#include <mutex>

namespace platform {

/// Changes on their way to the main queue; more may join them until they are taken.
struct Outbox {
    std::mutex mutex;
    std::vector<EntryChanges> changes;
    bool taken = false;
};

/// What follows `Of the queue` is touched by jobs of the queue alone.
struct FolderFeed::State : std::enable_shared_from_this<FolderFeed::State> {
    State(std::unique_ptr<EntrySource> theSource, MainQueue& theMain, DirectoryWatcher& theWatcher,
          Receiver theReceiver)
        : main(theMain),
          watcher(theWatcher),
          receiver(std::move(theReceiver)),
          source(std::move(theSource)) {}

    MainQueue& main;
    DirectoryWatcher& watcher;
    const Receiver receiver;
    CancelFlag cancel;
    std::unique_ptr<WorkQueue> queue =
        std::make_unique<WorkQueue>("platform.folder", WorkPriority::userInitiated);

    // Of the queue.
    std::unique_ptr<EntrySource> source;
    DirectoryWatcher::Token watch;
    DirectoryWatcher::Token parentWatch;
    std::vector<DirectoryWatcher::Token> dependencyWatches;
    /// Of the folder that the last reading was made of.
    std::optional<FileIdentity> identity;
    /// A reading is at the end of the queue: it will tell what the notices before it would.
    bool readingDue = false;
    /// The last one; none behind which something else was told.
    std::shared_ptr<Outbox> outbox;

    /// Runs the job on the queue, unless the feed has ended by then.
    void enqueue(std::function<void(State&)> job) {
        queue->async([weak = weak_from_this(), job = std::move(job)] {
            if (const auto self = weak.lock(); self && !self->cancel.isCancelled())
                job(*self);
        });
    }

    void tell(std::function<void(const Receiver&)> job) {
        outbox.reset();
        main.async([weak = weak_from_this(), job = std::move(job)] {
            if (const auto self = weak.lock(); self && !self->cancel.isCancelled())
                job(self->receiver);
        });
    }

    /// A storm of changes is told in as many pieces as the main thread has time for.
    void tellChanges(EntryChanges changes) {
        if (outbox && join(*outbox, changes))
            return;
        const auto box = std::make_shared<Outbox>();
        box->changes.push_back(std::move(changes));
        tell([box](const Receiver& to) {
            std::vector<EntryChanges> all;
            {
                const std::lock_guard lock(box->mutex);
                box->taken = true;
                all.swap(box->changes);
            }
            to.changed(all);
        });
        outbox = box;
    }

    /// False when it is too late.
    static bool join(Outbox& box, EntryChanges& changes) {
        const std::lock_guard lock(box.mutex);
        if (box.taken)
            return false;
        if (!changes.renamings.empty()) {
            box.changes.push_back(std::move(changes));
            return true;
        }
        std::vector<EntryFact>& facts = box.changes.back().facts;
        std::move(changes.facts.begin(), changes.facts.end(), std::back_inserter(facts));
        return true;
    }

    std::optional<FileIdentity> identityNow() const {
        const auto attributes = FileManager::attributes(source->folder().path(), FollowLinks::yes);
        return attributes ? std::optional(attributes->identity) : std::nullopt;
    }

    void follow() {
        watch =
            watcher.watch(source->folder(), *queue, [weak = weak_from_this()](const auto& changes) {
                if (const auto self = weak.lock())
                    self->take(changes);
            });
    }

    /// Watches before it reads, so that nothing falls between the two.
    void readAll() {
        const std::optional<FileIdentity> now = identityNow();
        if (!watch || now != identity)
            follow();
        Result<std::vector<DocumentEntry>> entries = source->readAll(cancel);
        if (!entries) {
            fail(entries.error());
            return;
        }
        sortEntries(*entries, cancel);
        followDependencies();
        parentWatch.reset();
        const bool replaced = identity && now != identity;
        identity = now;
        const auto sorted = std::make_shared<std::vector<DocumentEntry>>(std::move(*entries));
        tell([sorted, replaced](const Receiver& to) { to.read(std::move(*sorted), replaced); });
    }

    void fail(const Error& error) {
        watch.reset();
        identity.reset();
        tell([error](const Receiver& to) { to.failed(error); });
        awaitReturn();
    }

    /// A folder that is gone may come back under its name, and one that cannot be read may become
    /// readable: its parent tells of both.
    void awaitReturn() {
        const std::optional<Url> parent = source->folder().deletingLastPathComponent();
        if (parentWatch || !parent || !FileManager::exists(parent->path()))
            return;
        parentWatch =
            watcher.watch(*parent, *queue, [weak = weak_from_this()](const auto& changes) {
                const auto self = weak.lock();
                if (!self || self->cancel.isCancelled())
                    return;
                const std::string_view name = self->source->folder().lastPathComponent();
                for (const DirectoryChange& change : changes)
                    if (change.name == name || change.kind == DirectoryChange::Kind::overflow) {
                        self->readAll();
                        return;
                    }
            });
        // It may have come back before the watch began.
        if (identityNow())
            readAll();
    }

    void followDependencies() {
        std::vector<DirectoryWatcher::Token> watches;
        for (const Url& folder : source->dependencies())
            watches.push_back(
                watcher.watch(folder, *queue, [weak = weak_from_this()](const auto& changes) {
                    const auto self = weak.lock();
                    if (!self || self->cancel.isCancelled())
                        return;
                    for (const DirectoryChange& change : changes)
                        if (change.name == self->source->dependencyName()) {
                            self->readAgain();
                            return;
                        }
                }));
        dependencyWatches = std::move(watches);
    }

    void readAgain() {
        readAll();
        if (source->settlingTime() > Duration::zero())
            main.after(source->settlingTime(), [weak = weak_from_this()] {
                if (const auto self = weak.lock())
                    self->enqueue([](State& state) { state.readAll(); });
            });
    }

    void take(const std::vector<DirectoryChange>& changes) {
        if (cancel.isCancelled())
            return;
        const bool gone = std::any_of(changes.begin(), changes.end(), [](const auto& change) {
            return change.kind == DirectoryChange::Kind::folderGone;
        });
        if (gone)
            watch.reset();
        if (readingDue)
            return;
        std::optional<EntryChanges> known;
        if (!gone)
            known = source->resolve(changes);
        if (!known) {
            readingDue = true;
            enqueue([](State& state) {
                state.readingDue = false;
                state.readAgain();
            });
        } else if (!known->facts.empty() || !known->renamings.empty()) {
            tellChanges(std::move(*known));
        }
    }
};

FolderFeed::FolderFeed(std::unique_ptr<EntrySource> source, MainQueue& main,
                       DirectoryWatcher& watcher, Receiver receiver)
    : state_(std::make_shared<State>(std::move(source), main, watcher, std::move(receiver))) {
}

FolderFeed::~FolderFeed() {
    state_->cancel.cancel();
    // The watches end before the queue on which they report.
    state_->queue->sync([this] {
        state_->watch.reset();
        state_->parentWatch.reset();
        state_->dependencyWatches.clear();
    });
    state_->queue.reset();
}

void FolderFeed::read(std::function<void()> done) {
    state_->enqueue([done = std::move(done)](State& state) {
        state.readAll();
        if (done)
            state.tell([done](const Receiver&) { done(); });
    });
}

void FolderFeed::verify() {
    state_->enqueue([](State& state) {
        if (!state.identity || state.identityNow() != state.identity)
            state.readAll();
    });
}

} // namespace platform
