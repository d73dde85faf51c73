#pragma once

#include "platform/cloud/Backoff.h"
#include "platform/cloud/DirtyFolders.h"
#include "platform/cloud/RemoteLister.h"
#include "platform/cloud/SyncExecutor.h"
#include "platform/cloud/SyncState.h"

#include <atomic>
#include <map>
#include <mutex>
#include <optional>
#include <set>
#include <string>
#include <vector>

namespace platform {

class LocalScanner;

/// Makes both sides of a store agree, as far as that goes now: looks at the disk, asks the remote,
/// and plans and carries out until nothing is left to do. One run at a time, not on the store's
/// queue.
class Synchronizer {
public:
    struct Request {
        /// By the user's command, or because the way to the remote has changed: everything is
        /// tried now, and looked for a second time without a delay.
        bool commanded = false;
        /// At all of it; else at the folders that were marked since.
        bool lookAtDisk = true;
        /// Folders of the remote to be read; all of them when `everything`.
        std::vector<ItemId> folders;
        bool everything = true;
        /// What is missing since one listing is looked for once more.
        bool lookAgain = false;
    };
    struct Report {
        Failure failure;
        /// Files are being written to: look again after that time.
        std::optional<Duration> settlesIn;
        /// One of them, relative to the store's root; "" when it is others that change.
        std::string youngFile;
        /// Something is missing on the remote since one listing.
        bool secondLook = false;
        /// When something that failed is to be tried again.
        std::optional<Date> retryAt;
        std::optional<DeletionQuestion> question;
        /// Of the disk, relative to the store's root, as far as it was looked at: to be watched.
        std::vector<std::string> folders;
        /// These are all that there are.
        bool allFolders = false;
        /// How long the looks at the disk took.
        Duration looked{0};
        std::size_t changes = 0;
        /// Items that wait for another try, or for a network that does not cost.
        std::size_t waiting = 0;
        /// Folders of the remote could not be read: of those nothing is known, all else goes on.
        Failure incomplete;
        /// The same of a folder of the disk. Nothing is tried again because of it: a notice tells
        /// when it can be read.
        Failure unreadable;

        void settle(std::optional<Duration> delay, const std::string& file = {}) {
            if (delay && (!settlesIn || *settlesIn < *delay))
                settlesIn = delay;
            if (!file.empty())
                youngFile = file;
        }
    };

    Synchronizer(StoreContext& context, TransferQueue& transfers, RateLimiter& limiter,
                 CancelFlag& cancel, bool afterCrash, RemoteLister::Written written);

    Report run(const Request& request);
    /// Something happened in the folder of the disk (relative to the store's root): the next run
    /// looks at it. From any thread.
    void changedOnDisk(const std::string& folder) { dirty_.add(folder); }
    /// Ends a run soon, and those that come. From any thread.
    void cancel() { executor_.cancel(); }
    /// Contents are transferred by command alone, from the next plan on. From any thread.
    void setMetered(bool metered) { metered_ = metered; }
    /// What the last plans left for a network that is not metered. From any thread.
    std::vector<PendingWork> waitingForNetwork() const;
    /// On the store's queue.
    [[nodiscard]] Failure answer(DeletionAnswer answer);
    static std::optional<DeletionQuestion> question(StateQueries& queries);
    static std::vector<PendingWork> pending(StateQueries& queries);

private:
    struct Trouble {
        Backoff backoff;
        std::int64_t op = 0;
        int tries = 0;
        int triesInThisRun = 0;
        Date nextAt;
    };

    /// What has to be looked at now.
    DirtyFolders::Marks marksOf(const Request& request);
    Failure look(DirtyFolders::Marks marks, Report& report);
    Failure settleLook(const LocalScanner& scanner, bool whole, Report& report);
    void noteVanished(const std::vector<ItemId>& vanished, Report& report);
    bool isVanishingDue();
    Failure list(const std::vector<ItemId>& folders, bool everything, Report& report);
    /// What vanished counts as deleted, unless it is too much.
    Failure settleLocal(const std::vector<ItemId>& vanished, Report& report);
    Failure settleRemote(bool commanded, Report& report);
    Failure ask(const DeletionQuestion& question, Report& report);
    Failure withdraw(Side side);
    void forgetAnswer(Side side);
    bool isAlarming(const std::vector<ItemId>& items, Side side);
    /// Nothing more has vanished for a while: who deletes has come to the end.
    bool isSteady(Side side, const std::vector<ItemId>& vanished, Report& report);
    bool isAnswered(Side side);
    std::int64_t recentlyDeleted(Side side);
    void countDeleted(Side side, std::int64_t items);
    Failure carryOutAll(Report& report);
    std::vector<SyncStep> plan();
    /// What the disk has lost while the machine stopped; remembered until it is there again.
    Failure noteDamage();
    void forgetRepaired();
    SyncTrees trees();
    Failure digest(SyncExecutor::Outcome& outcome, const std::vector<SyncStep>& steps,
                   Report& report);
    void noteTrouble(const SyncStep& step, const Error& error);
    void forgetTrouble(ItemId item);
    bool mayTry(ItemId item);
    /// Takes the transfers that nobody asked for out of the plan of a metered network.
    void leaveTransfers(std::vector<SyncStep>& steps);

    StoreContext& context_;
    CancelFlag& cancel_;
    RemoteLister::Written written_;
    SyncExecutor executor_;
    std::map<ItemId, Trouble> troubles_;
    struct Vanishing {
        std::set<ItemId> items;
        Duration since{0};
    };
    std::map<Side, Vanishing> vanishing_;
    DirtyFolders dirty_;
    bool lookedAtAll_ = false; // since the start
    std::atomic<bool> metered_{false};
    bool commanded_ = false; // the run that is under way
    mutable std::mutex waitingMutex_;
    std::vector<PendingWork> waiting_; // guarded by waitingMutex_
    bool afterCrash_ = false;                // and not looked for damage yet
    std::map<ItemId, std::int64_t> damaged_; // with the operation that tells of it
};

} // namespace platform
