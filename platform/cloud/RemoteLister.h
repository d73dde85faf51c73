#pragma once

#include "platform/base/OperationQueue.h"
#include "platform/cloud/Arrivals.h"
#include "platform/cloud/ListingBatch.h"

#include <deque>
#include <functional>
#include <future>
#include <set>
#include <unordered_map>

namespace platform {

/// Brings what the remote has into the store: folders, and promises for files. Everything that
/// stands on the disk already is left as it is; what only both sides together can decide (moves,
/// deletions, new content on both) is recorded and left as well.
///
/// Changes the disk on the calling thread while the next folders are read from the remote and the
/// store's queue writes the batch before down; a batch reaches the disk before its rows. Stopped
/// anywhere, a later run goes on where the last written batch ends.
class RemoteLister {
public:
    /// Failures that are not of one folder: going on would only repeat them.
    static bool stopsEverything(const Error& error);

    enum class Depth {
        /// The given folders, and below them what is new.
        newFolders,
        /// The given folders and all folders below them.
        everything
    };
    /// Called on the store's queue after each written batch.
    using Written = std::function<void(const ListingBatch& batch)>;

    RemoteLister(StoreContext& context, CancelFlag& cancel, Written written);
    ~RemoteLister();
    RemoteLister(const RemoteLister&) = delete;
    RemoteLister& operator=(const RemoteLister&) = delete;

    /// None when every folder could be read; else the first cause that kept one from it. A folder
    /// that cannot be read does not stop the others; a remote that is away, a full disk and a
    /// cancellation do.
    [[nodiscard]] Failure run(const std::vector<ItemId>& folders, Depth depth);

private:
    struct Folder {
        ItemId item = 0;
        std::string remotePath;
        /// Relative to the store's root.
        std::string localPath;
        /// Not in the database yet: nothing of it is known.
        bool unknown = false;
        /// Made by this run: nothing lies in it.
        bool empty = false;
        /// Not on the disk: what is in it is written down, and nothing is made for it.
        bool recordOnly = false;
    };
    struct Known {
        ScanRow scan;
        std::vector<ItemState> states;
        /// By the name that the remote, and that the user, sees in this folder.
        std::unordered_map<std::string_view, const ItemState*> remote;
        std::unordered_map<std::string_view, const ItemState*> shown;
    };
    struct Visit {
        const Folder& folder;
        Known known;
        Arrivals::Spot spot;
        std::int64_t generation = 1;
        std::vector<RefusedRow> refused;
    };

    /// A folder whose listing is being read while others are worked on.
    struct Reading {
        Folder folder;
        std::future<Result<RemoteListing>> listing;
    };

    void waitFor(const std::vector<ItemId>& folders);
    [[nodiscard]] Failure listWaiting();
    void readAhead();
    Failure bringIn(const Folder& folder, const Result<RemoteListing>& listing);
    Known knownOf(const Folder& folder);
    Result<Arrivals::Spot> spotOf(const Folder& folder);
    Failure take(Visit& visit, const RemoteEntry& entry);
    Failure takeKnown(Visit& visit, const RemoteEntry& entry, const ItemState& state);
    bool promiseStands(const ItemState& state);
    Failure takeNew(Visit& visit, const RemoteEntry& entry, const ItemState* state);
    void addRemoteOnly(Visit& visit, const RemoteEntry& entry);
    // See RemoteListerMoves.cpp.
    /// The known item that was elsewhere on the remote and is this one now.
    std::optional<ItemState> movedHere(const Visit& visit, const RemoteEntry& entry);
    void takeMoved(Visit& visit, const RemoteEntry& entry, const ItemState& state);
    void listAgain();
    void descendKnown(const Visit& visit, const RemoteEntry& entry, const ItemState& state);
    RemoteRow rowOf(const Visit& visit, const RemoteEntry& entry) const;
    void noteFailure(const Folder& folder, const Error& error);
    /// Hands the batch to the queue once the one before has been written.
    Failure writeDown();
    Failure writtenSoFar();
    [[nodiscard]] Failure writeAll();

    StoreContext& context_;
    CancelFlag& cancel_;
    Written written_;
    Arrivals arrivals_;
    Depth depth_ = Depth::newFolders;
    /// Nothing was known before this run, so that nothing can have moved.
    bool first_ = false;
    std::deque<Folder> waiting_;
    std::set<ItemId> visited_;
    // Of this run: items that were found by their identity at another place, and those in whose
    // place something of another identity was found and taken for them.
    std::set<ItemId> moved_;
    std::set<ItemId> replaced_;
    std::set<ItemId> again_;
    std::deque<Reading> reading_;
    OperationQueue readers_;
    ListingBatch batch_;
    std::future<Failure> writing_;
    Failure firstFailure_;
};

} // namespace platform
