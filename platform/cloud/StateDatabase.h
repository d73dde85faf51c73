#pragma once

#include "platform/base/Result.h"
#include "platform/cloud/StateRecords.h"

#include <atomic>
#include <functional>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace platform {

/// Questions to the state database. A fault of the database ends in an empty answer and in
/// takeFault().
class StateQueries {
public:
    virtual ~StateQueries();
    StateQueries(const StateQueries&) = delete;
    StateQueries& operator=(const StateQueries&) = delete;

    std::optional<ItemState> state(ItemId item);
    /// Everything that either side, or the user, has in the folder.
    std::vector<ItemState> childrenOf(ItemId folder);
    std::optional<ItemId> itemAt(const Place& place);
    /// The item at a path relative to the root ("" is the root).
    std::optional<ItemId> itemAtPath(std::string_view path);
    /// The path relative to the root at which the user sees the item.
    std::optional<std::string> pathOf(ItemId item);
    /// Its path on the remote as last observed.
    std::optional<std::string> remotePathOf(ItemId item);
    /// Its path on the disk as last observed.
    std::optional<std::string> localPathOf(ItemId item);
    /// Everything that is not the same on both sides.
    std::vector<ItemState> disagreements();
    std::optional<ItemId> localItemAt(const Place& place);
    std::optional<ItemId> remoteItemAt(const Place& place);
    std::optional<ItemId> itemOfRemoteId(std::string_view remoteId);
    /// Everything that was seen on the disk; in one folder of it; with that identity (promises
    /// have none of their own).
    std::vector<ItemState> localItems();
    std::vector<ItemState> localItemsIn(ItemId folder);
    std::vector<ItemState> localItemsOf(const FileIdentity& identity);
    /// What as many whole listings of its folder in a row have not seen.
    std::vector<ItemId> missingFromRemote(int listings);
    /// The item and what is in it on that side.
    std::vector<ItemId> treeOf(ItemId item, Side side);
    /// Folders of the remote with their paths there, the root ("") among them.
    std::vector<std::pair<ItemId, std::string>> remoteFolders();
    /// Items that both sides have had.
    std::int64_t agreedItems();
    std::int64_t agreedItemsIn(ItemId folder);
    /// Items whose folded name contains the folded text, at most `limit`.
    std::vector<ItemId> itemsNamed(std::string_view text, std::size_t limit);

    ScanRow scan(ItemId folder, Side side);
    std::vector<ItemId> unfinishedScans(Side side);
    std::vector<OpRow> operations();
    std::vector<RefusedRow> refused(ItemId folder, Side side);
    std::int64_t refusedCount(Side side);
    /// Of both sides, with the folder's path before the name.
    std::vector<RefusedRow> refusedPaths(std::size_t limit);
    /// Items with a role and an observation of the disk.
    std::vector<ItemState> sharedItems();
    StoreCounts counts();
    /// "" when there is none.
    std::string meta(std::string_view name);

    Failure takeFault();

protected:
    struct Handles;
    explicit StateQueries(std::unique_ptr<Handles> handles);
    std::unique_ptr<Handles> handles_;
};

/// The state database with the right to write. Belongs to one queue; only newItemId() is safe from
/// any thread.
class StateDatabase final : public StateQueries {
public:
    /// Opens, or makes, the database. databaseFromLaterVersion: untouched. readCorrupt: damaged.
    /// `thorough` reads all of it to find damage (after a crash).
    static Result<std::unique_ptr<StateDatabase>> open(const std::string& path, bool thorough);

    /// Runs the work in one transaction and brings it to the disk; when the work, or any step of
    /// it, fails, nothing of it is kept.
    [[nodiscard]] Failure transaction(const std::function<Failure()>& work);
    /// From now on from a range of its own, as in a database that was made anew.
    [[nodiscard]] Failure beginNewNumbers();
    ItemId newItemId() { return next_.fetch_add(1, std::memory_order_relaxed); }

    // Within a transaction:
    void insertItem(const ItemRow& item);
    /// None hides the item until it has a name again.
    void setItemPlace(ItemId item, const std::optional<Place>& place);
    void putRemote(ItemId item, const RemoteRow& row);
    void setRemoteGeneration(ItemId item, std::int64_t generation);
    void putLocal(ItemId item, const LocalRow& row);
    void removeLocal(ItemId item);
    /// The item and everything in it is not on the disk any more. What neither the remote nor a
    /// base knows is forgotten altogether.
    void forgetLocalTree(ItemId item);
    void removeRemote(ItemId item);
    /// Another one has its place on the remote. Where it is itself, if it still is, the listings of
    /// other folders tell; until then it counts as missing since one listing.
    void displaceRemote(ItemId item);
    /// The same of one whose folder is no more: it counts as missing from this one.
    void displaceRemote(ItemId item, ItemId folder);
    /// Forgets an item with all that was known of it; what the user saw in it has no place then.
    void removeItem(ItemId item);
    void putBase(ItemId item, const BaseRow& row);
    void removeBase(ItemId item);
    /// What lies in the one folder on the disk lies in the other.
    void moveLocalChildren(ItemId from, ItemId to);
    /// A folder's listing number. A row of the remote whose generation equals it is there; one less
    /// is missing since one whole listing, two less since two. The number moves on only when
    /// something is missing, so that a listing without news writes nothing.
    void putScan(ItemId folder, Side side, const ScanRow& scan);
    void clearRefused(Side side);
    void setRefused(ItemId folder, Side side, const std::vector<RefusedRow>& rows);
    /// Inserts (id 0) or replaces; answers the id.
    std::int64_t putOperation(const OpRow& row);
    void removeOperation(std::int64_t id);
    void setMeta(std::string_view name, std::string_view value);
    /// Records the device of the tree, and changes it wherever an identity names the earlier one.
    void replaceDevice(const std::string& before, const std::string& now);

private:
    explicit StateDatabase(std::unique_ptr<Handles> handles);
    Failure prepareSchema(bool thorough);
    /// Within a transaction; the new end of the numbers that are kept, if it moves.
    std::optional<std::int64_t> keepNumbers();
    std::atomic<ItemId> next_{0};
    std::int64_t keptUntil_ = 0;
};

/// Reads the database while another, of this or of another process, writes. Safe from any thread,
/// one caller at a time.
class StateReader {
public:
    static Result<std::shared_ptr<StateReader>> open(const std::string& path);
    ~StateReader();

    template<class Ask>
    auto ask(const Ask& question) {
        const std::lock_guard lock(mutex_);
        return question(*queries_);
    }

private:
    class Queries;
    StateReader();
    std::mutex mutex_;
    std::unique_ptr<StateQueries> queries_;
};

} // namespace platform
