#pragma once

#include "platform/cloud/KnownLocals.h"
#include "platform/cloud/StoreContext.h"
#include "platform/files/ContentProvider.h"

#include <map>
#include <optional>
#include <set>
#include <string>
#include <vector>

namespace platform {

/// Looks at the disk and writes down what is there: at the whole tree, or at some folders and what
/// is new in them. Items are told by their place first (programs save by putting a new file in the
/// place of the old one), else by identity, and promises by their marks. What cannot be read is
/// unknown, and never absent. What is found is looked at again on the store's queue before it is
/// written down, where nobody else changes it.
class LocalScanner {
public:
    LocalScanner(StoreContext& context, CancelFlag& cancel)
        : context_(context), cancel_(cancel), known_(context) {}

    // One look an object; not on the store's queue.
    [[nodiscard]] Failure lookAtAll();
    /// At these folders, relative to the root; of one that is not known, at the next one above.
    [[nodiscard]] Failure lookAt(const std::set<std::string>& folders);

    /// Known items that are not where they were. They are still written down as if they were. Of a
    /// look at some folders they may be elsewhere: only a look at all tells what is deleted.
    const std::vector<ItemId>& vanished() const { return vanished_; }
    /// Something may change once more without a sign of it: look again after that time...
    std::optional<Duration> settlesIn() const { return settlesIn_; }
    /// ...at these folders.
    const std::set<std::string>& unsettled() const { return unsettled_; }
    /// One of the files in them that were written to a moment ago; "" when there is none.
    const std::string& youngFile() const { return youngFile_; }
    /// What was found was changed by the look itself, or meanwhile: look again at once.
    bool again() const { return again_; }
    /// The known item is where this look says.
    bool saw(ItemId item) const { return seen_.contains(item); }
    /// What was found can be told only by a look at all.
    bool wantsAll() const { return wantsAll_; }
    /// Why a folder, or an item in one, could not be looked at.
    const Failure& unreadable() const { return unreadable_; }
    /// The folders that were looked at and those in them, relative to the root ("" for the root).
    const std::vector<std::string>& folders() const { return folders_; }

private:
    struct Found {
        std::string path; // relative, of the item; of a promise's sidecar in `sidecar`
        std::string sidecar;
        FileAttributes attributes;
        ItemId promised = 0;    // of a promise
        ItemId item = 0;        // as far as it is known
        std::size_t folder = 0; // index of the folder among visits_
        bool moved = false;
        std::size_t opens = SIZE_MAX; // index of its own visit, of a folder
    };
    struct Visit {
        std::string path;
        ItemId item = 0; // 0: of a folder that is new
        bool read = false;
    };

    // Looking; see LocalScanner.cpp.
    Failure begin();
    Failure lookAtVisits();
    void visitKnown(const std::set<std::string>& folders);
    Visit nearestKnown(const std::string& folder);
    Failure look(std::size_t visit);
    void take(std::size_t visit, const DirectoryEntry& entry);
    void takeUnreadable(std::size_t visit, const std::string& name, const Error& error);
    void takeSidecar(std::size_t visit, const std::string& name, const FileAttributes& attributes);
    void lookAfter(std::size_t visit, Duration delay);
    void noteUnknownPromise(const std::string& name, const Error& error);
    void note(Found found, std::size_t visit, bool isFolder);
    void refuse(std::size_t visit, const std::string& name, std::string reason);

    // Telling which is which; see LocalScannerMatching.cpp.
    const ItemState* folderElsewhere(const FileIdentity& identity);
    Failure matchMoved();
    bool claim(const ItemState& state);
    /// On the store's queue, as all that follows.
    void collectVanished();
    void dropUnagreed(std::vector<ItemId> items);
    bool isUnknown(const ItemState& state) const;
    bool isStillAbsent(ItemId item) const;
    bool stands(const Found& found) const;

    // Writing down; see LocalScannerRecords.cpp.
    Failure writeDown();
    void keepHalfWritten();
    void writeRefused();
    Failure write(Found& found);
    Failure clearPlace(Found& found, ItemId other);
    void writeKnown(const Found& found, const ItemState& state, const Place& place);
    void writeNew(const Found& found, const Place& place, bool folder);
    /// The user made something at a name that is only promised: it cannot have that name.
    Failure moveAside(Found& found, ItemId owner);
    Failure movePromiseAside(Found& found);
    void removeSpareSidecars();
    bool standsElsewhere(const ItemState& state, const std::string& sidecar) const;

    StoreContext& context_;
    CancelFlag& cancel_;
    KnownLocals known_;
    bool whole_ = true;
    std::vector<Visit> visits_;
    std::vector<Found> found_;
    std::set<ItemId> seen_;
    std::set<ItemId> readFolders_;
    std::set<ItemId> blind_; // folders of which nothing is known
    std::vector<std::pair<std::size_t, RefusedRow>> refused_;
    std::vector<std::string> spare_; // sidecars whose content is there
    std::vector<std::string> halfWritten_;
    std::vector<ItemId> vanished_;
    std::vector<std::string> folders_;
    std::set<std::string> unsettled_;
    std::string youngFile_;
    std::uint64_t device_ = 0;
    std::optional<Duration> settlesIn_;
    Failure fault_; // of the records
    Failure unreadable_;
    bool again_ = false;
    bool wantsAll_ = false;
    bool unknownPromise_ = false;
};

} // namespace platform
