#pragma once

#include "platform/cloud/AccountFile.h"
#include "platform/cloud/Backoff.h"
#include "platform/cloud/CloudContainer.h"
#include "platform/cloud/KeyValueSync.h"
#include "platform/cloud/Remote.h"
#include "platform/cloud/StoreContext.h"
#include "platform/cloud/StoreMoves.h"
#include "platform/cloud/StoreView.h"
#include "platform/cloud/Synchronizer.h"
#include "platform/cloud/Transfers.h"
#include "platform/files/DirectoryWatcher.h"

#include <atomic>
#include <condition_variable>
#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <optional>
#include <string>

namespace platform {

class RemoteLister;
class TransferActivity;

/// The store of one account: opens it, keeps the view that reads answer from, brings in what the
/// remote has and fetches contents. Where another process has the store, reads go on and changes
/// are refused, until that process is done.
class StoreEngine : public std::enable_shared_from_this<StoreEngine> {
public:
    struct Services {
        Clock& clock;
        DirectoryWatcher& watcher;
        FileProgressSubscription& progress;
        const Folders& folders;
        StoreFileSystem& disk;
        StoreViewSlot& slot;
        TransferActivity& activity;
        /// Called on a thread of the engine's when another device set values.
        std::function<void()> valuesChanged;
        /// The same when `problem`, `usable`, `question` or what waits may be something else.
        std::function<void()> conditionChanged;
    };
    using Done = std::function<void(const Failure& failure)>;

    StoreEngine(const Services& services, const AccountRecord& account,
                std::unique_ptr<Remote> remote);
    ~StoreEngine();
    StoreEngine(const StoreEngine&) = delete;
    StoreEngine& operator=(const StoreEngine&) = delete;

    /// Opens for changing and starts to follow the remote; or, `readOnly`, for reading alone.
    void open(bool readOnly);

    /// Cancels what runs, waits for it and gives the store back to others. Not on a queue of the
    /// engine's own.
    void stop();

    /// There is a tree to show.
    bool usable() const;
    /// In the user's language; none when all is well. Safe from any thread.
    std::optional<std::string> problem() const;
    const StoreLayout& layout() const { return layout_; }
    /// The first listing has come to its end. Safe from any thread.
    bool isListed() const;

    [[nodiscard]] Failure makeLocal(const Url& item, CancelFlag& cancel);
    [[nodiscard]] Failure moveItem(const Url& from, const Url& to);
    /// The three as CloudDocumentService has them, for items of this store.
    [[nodiscard]] Failure removeItem(const Url& item);
    [[nodiscard]] Failure evictItem(const Url& item);
    [[nodiscard]] Failure deleteContainer(const CloudContainer& container);

    KeyValueSync& values() { return values_; }
    /// Brings the values and the remote's together, soon.
    void exchangeValues();

    /// Brings in what is new in the folder, or everywhere. `done` is called on a thread of the
    /// engine's.
    void refresh(const std::optional<Url>& folder, Done done);
    /// Makes both sides agree now, whatever has failed before. `done` as above.
    void sync(Done done);
    /// While it is metered, contents that nobody waits for stay where they are. From any thread.
    void setMetered(bool metered);
    /// What stays because of that.
    std::vector<PendingWork> waitingForNetwork() const;
    std::optional<DeletionQuestion> question() const;
    [[nodiscard]] Failure answer(DeletionAnswer answer);
    void freeBytes(std::function<void(const Result<std::uint64_t>&)> done);

private:
    // On the store's queue.
    void openForChanges();
    void openForReading();
    void begin(OpenedStore store);
    void readContainers();
    void watchContainers();
    void readRoles();
    void publish();

    /// Proves, once, that the remote is there and the right one. From any thread but the store's
    /// queue.
    Failure connect();

    /// Keeps the store open until it is dropped; none when it is not open for changes.
    std::shared_ptr<void> use();
    /// Runs the work with a remote that has proved to be there; once more when it had gone away.
    Failure withRemote(const std::function<Failure()>& work);
    void watchValues();
    void changedByUser();
    void recordMoves();

    // What is to be done so that both sides agree; see StoreEngineSync.cpp. From any thread.
    enum class Alarm { notice, settle, secondLook, retry, poll, sweep };
    struct Pending {
        Clock::AlarmId id = 0;
        Synchronizer::Request request;
    };
    void want(const Synchronizer::Request& wanted);
    void wantAfter(Alarm alarm, Duration delay, const Synchronizer::Request& wanted);
    void runWanted();
    std::shared_ptr<Synchronizer> synchronizer() const;

    // On the listing queue.
    Synchronizer::Report synchronize(const Synchronizer::Request& request);
    /// What is being written to is waited for, so many times.
    void syncNow(Done done, int times);
    void plan(const Synchronizer::Report& report);
    void watchFolders(const std::vector<std::string>& folders, bool all);
    /// Something happened in the folder of the disk. From any thread.
    void noticed(const std::string& folder);
    /// What is watched there, or below it, may have another path now.
    void rewatch(const std::string& folder);
    void watchRemote();

    // On the listing queue.
    Failure followRemote();
    Failure list(const std::vector<ItemId>& folders, bool everything);
    /// On the store's queue, for every batch of a listing.
    void written(const ListingBatch& batch);
    Failure refreshNow(const std::optional<Url>& folder);

    /// A single folder that cannot be read is no reason to call the store unread.
    static bool concernsWholeStore(const Error& error);
    Failure checkRemoteMark(const std::string& mark);
    void retryLater(std::function<void(StoreEngine&)> job);
    void setProblem(const Failure& failure);
    Failure fetch(Transfers& transfers, const Url& item, CancelFlag& cancel);
    std::shared_ptr<Transfers> transfers() const;
    Error notOpen() const;

    Services services_;
    AccountRecord account_;
    StoreLayout layout_;
    std::unique_ptr<Remote> remote_;
    CancelFlag cancel_;

    KeyValueSync values_;

    mutable std::mutex mutex_;
    std::condition_variable unused_;
    int uses_ = 0; // guarded by mutex_, as are the next thirteen
    std::vector<StoreMoves::Moved> moved_; // on the disk, and not yet written down
    std::shared_ptr<Synchronizer> synchronizer_;
    std::optional<DeletionQuestion> question_;
    std::size_t waiting_ = 0;
    std::optional<Synchronizer::Request> wanted_;
    std::map<Alarm, Pending> alarms_;
    Duration nextLook_{0}; // because of a notice
    Failure problem_;
    std::optional<std::string> notice_; // what had to be done at the start
    std::shared_ptr<Transfers> transfers_;
    Clock::AlarmId retry_ = 0;
    bool usable_ = false;
    bool listed_ = false;
    Backoff backoff_;

    // Of the store's queue alone.
    std::optional<OpenedStore> store_;
    std::optional<StoreContext> context_;
    StoreView view_;
    DirectoryWatcher::Token rootWatch_;
    std::map<std::string, DirectoryWatcher::Token> containerWatches_;
    DirectoryWatcher::Token valuesWatch_;

    // Of the listing queue alone.
    bool followed_ = false; // the remote has been reached, and all was looked at since
    std::map<std::string, DirectoryWatcher::Token> localWatches_;
    std::map<ItemId, std::pair<std::string, DirectoryWatcher::Token>> remoteWatches_;

    std::mutex connecting_;
    std::atomic<bool> connected_{false};
    std::atomic<bool> metered_{false};

    std::unique_ptr<WorkQueue> queue_;
    std::unique_ptr<WorkQueue> listing_;
    std::unique_ptr<WorkQueue> exchanging_; // of values
};

} // namespace platform
