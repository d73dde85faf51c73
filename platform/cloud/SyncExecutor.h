#pragma once

#include "platform/cloud/LocalContent.h"
#include "platform/cloud/Remote.h"
#include "platform/cloud/StoreContext.h"
#include "platform/cloud/SyncPlan.h"
#include "platform/cloud/TransferQueue.h"

#include <functional>
#include <map>
#include <mutex>
#include <optional>
#include <set>

namespace platform {

class RateLimiter;

/// Carries plans out. A step is looked at once more before it is made, against the records and the
/// disk; one whose reason is gone is left out and planned anew. What was agreed on is written down
/// after the effect is on the disk, or proven on the remote and brought to its disk: one sync for
/// many. One run at a time, not on the store's queue.
class SyncExecutor {
public:
    struct Outcome {
        /// Steps that were made. One whose reason or whose folder is not there is none of them.
        std::size_t done = 0;
        /// The remote has something else in these folders than was known.
        std::set<ItemId> outdated;
        /// The disk has, in these (relative to the store's root).
        std::set<std::string> disturbed;
        /// A file is still being written to; when that may be over.
        std::optional<Duration> settlesIn;
        std::string youngFile;
        /// Why nothing more can be done at all: the remote is away, or somebody cancelled.
        Failure stopped;
        std::map<ItemId, Error> failed;
    };

    SyncExecutor(StoreContext& context, TransferQueue& transfers, RateLimiter& limiter)
        : context_(context), transfers_(transfers), limiter_(limiter) {}

    Outcome run(const std::vector<SyncStep>& steps);
    /// Ends a run soon, and those that come. From any thread.
    void cancel();

private:
    struct Work {
        SyncStep step;
        ItemState state;
        std::string localPath;  // relative; of what is on the disk
        std::string remotePath; // of what is on the remote
        /// Nothing was made: something else has to come first, or the reason is gone.
        bool leftOut = false;
    };
    struct Staged {
        std::string name;
        RemoteEntry version;
        Bytes hash;
    };

    void carryOut(const SyncStep& step);
    std::optional<Work> prepare(const SyncStep& step);
    Failure make(Work& work, CancelFlag& cancel);
    void note(const Work& work, const Failure& failure);
    std::set<std::string> foldersOf(const Work& work);
    static Failure leaveOut(Work& work) {
        work.leftOut = true;
        return std::nullopt;
    }
    bool isStopped();

    // Records.
    Failure adopt(const Work& work);
    bool standsHere(const Work& work);
    Failure merge(Work& work);
    Failure forget(const Work& work);
    /// The content on the disk is the one that was agreed on after all.
    Failure refreshBase(const Work& work, const FileAttributes& attributes);

    // The disk; see SyncExecutorDisk.cpp.
    Failure arrive(Work& work, CancelFlag& cancel);
    Failure moveHere(Work& work);
    Failure moveOnDisk(const std::string& from, const std::string& to);
    /// `before` hears of each name that is tried.
    Failure moveAside(const Work& work, std::string& place,
                      const std::function<Failure(const std::string& name)>& before);
    Failure keep(Work& work);
    Failure keepNow(Work& work);
    Failure keepFileNow(const Work& work, const std::string& path);
    Failure keepFolderNow(Work& work, const std::string& path);
    bool holdsNoItem(ItemId folder, const std::string& path);
    bool isSpareCopy(const std::string& sidecar);
    bool isAsRecorded(const Work& work, const std::string& path);

    // The remote; see SyncExecutorRemote.cpp.
    Failure makeFolder(Work& work, CancelFlag& cancel);
    Failure moveThere(Work& work, CancelFlag& cancel);
    Failure removeThere(const Work& work, CancelFlag& cancel);
    Failure upload(Work& work, CancelFlag& cancel);
    Failure uploadChange(Work& work, CancelFlag& cancel);
    Failure send(Work& work, const std::string& path, const Place& place,
                 const RemoteCondition& condition, CancelFlag& cancel);

    // Contents that come; see SyncExecutorContents.cpp.
    Failure download(const Work& work, CancelFlag& cancel);
    Failure reconcile(const Work& work, CancelFlag& cancel);
    Failure takeVersion(const Work& work, const Staged& staged);
    Result<Staged> stage(const Work& work, CancelFlag& cancel);
    Failure replace(const Work& work, const Staged& staged);
    Failure replaceNow(const Work& work, const Staged& staged);
    Failure exchangeStaged(const Work& work, const std::string& stagedPath);
    Failure keepBoth(const Work& work, const Staged& staged);
    Failure placeNow(const Work& work, const Staged& staged, const std::string& path);
    void discard(const Staged& staged);

    std::optional<std::string> remotePlace(const Place& place);
    RemoteRow rowOf(const Place& place, const RemoteEntry& entry, const ItemState& before) const;
    struct Agreement {
        ItemId item = 0;
        BaseRow base;
        /// What the remote has since; where no other step needs to know it sooner.
        std::optional<RemoteRow> remote;
    };
    /// Once the effect is surely on both disks.
    void agreeLater(ItemId item, BaseRow base, std::optional<RemoteRow> remote = {});
    Failure flush(CancelFlag& cancel);

    StoreContext& context_;
    TransferQueue& transfers_;
    RateLimiter& limiter_;
    std::mutex mutex_;
    Outcome outcome_; // guarded by mutex_, as are the next three
    std::vector<Agreement> agreements_;
    std::set<CancelFlag*> running_;
    bool cancelled_ = false;
};

/// What a stopped program left of a content that was being replaced. On the store's queue.
void resumeReplacement(StoreContext& context, const OpRow& op);
bool isReplacement(const OpRow& op);
/// The same of a content that had to leave its name to the remote's.
void resumeConflict(StoreContext& context, const OpRow& op);
bool isConflict(const OpRow& op);

} // namespace platform
