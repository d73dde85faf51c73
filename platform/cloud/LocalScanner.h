#pragma once

#include "platform/cloud/StoreContext.h"
#include "platform/cloud/StoreView.h"
#include "platform/files/ContentProvider.h"

#include <map>
#include <optional>
#include <set>
#include <unordered_map>
#include <vector>

namespace platform {

/// Looks at the whole tree on the disk and writes down what is there. Items are told by their place
/// first (programs save by putting a new file in the place of the old one), else by identity, and
/// promises by their marks. What cannot be read is unknown, and never absent. What is found is
/// looked at again on the store's queue before it is written down, where nobody else changes it.
class LocalScanner {
public:
    LocalScanner(StoreContext& context, CancelFlag& cancel) : context_(context), cancel_(cancel) {}

    /// Not on the store's queue.
    [[nodiscard]] Failure run();

    /// Known items that are not on the disk any more. They are still written down as if they were.
    const std::vector<ItemId>& vanished() const { return vanished_; }
    /// Something may change once more without a sign of it: look again after that time.
    std::optional<Duration> settlesIn() const { return settlesIn_; }
    /// What was found was changed by the look itself, or meanwhile: look again at once.
    bool again() const { return again_; }
    /// The folders of the tree, relative to its root ("" for the root).
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
    };

    Failure readKnown();
    Failure look(std::size_t visit);
    void take(std::size_t visit, const DirectoryEntry& entry);
    void takeSidecar(std::size_t visit, const std::string& name, const FileAttributes& attributes);
    void lookAfter(Duration delay);
    void noteUnknownPromise(const std::string& name, const Error& error);
    void note(Found found, std::size_t visit, bool isFolder);
    const ItemState* knownAt(ItemId folder, std::string_view name) const;
    void refuse(std::size_t visit, const std::string& name, std::string reason);
    void matchMoved();
    void collectVanished();

    // On the store's queue.
    Failure writeDown();
    Failure write(Found& found);
    /// The user made something at a name that is only promised: it cannot have that name.
    Failure moveAside(Found& found, ItemId owner);
    Failure movePromiseAside(Found& found);
    void writeNew(const Found& found, const Place& place, bool folder);
    bool stands(const Found& found) const;
    bool isStillAbsent(ItemId item) const;
    bool standsElsewhere(const ItemState& state, const std::string& sidecar) const;
    void removeSpareSidecars();

    StoreContext& context_;
    CancelFlag& cancel_;
    std::vector<ItemState> known_;
    std::unordered_map<ItemId, const ItemState*> byItem_;
    std::map<std::pair<ItemId, std::string_view>, const ItemState*> byPlace_;
    std::unordered_map<FileIdentity, const ItemState*, FileIdentityHash> byIdentity_;
    std::vector<Visit> visits_;
    std::vector<Found> found_;
    std::set<ItemId> seen_;
    std::set<ItemId> blind_; // folders of which nothing is known
    std::vector<std::pair<std::size_t, RefusedRow>> refused_;
    std::vector<std::string> spare_; // sidecars whose content is there
    std::vector<std::string> halfWritten_;
    std::vector<ItemId> vanished_;
    std::vector<std::string> folders_;
    std::uint64_t device_ = 0;
    std::optional<Duration> settlesIn_;
    bool again_ = false;
    bool unknownPromise_ = false;
};

} // namespace platform
