#pragma once

#include "platform/cloud/StoreContext.h"
#include "platform/cloud/StoreView.h"

#include <deque>
#include <map>
#include <set>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <vector>

namespace platform {

/// What the records have of the disk, for one look at it: read all at once, or as far as the look
/// comes. Not on the store's queue, which it asks.
class KnownLocals {
public:
    explicit KnownLocals(StoreContext& context) : context_(context) {}

    [[nodiscard]] Failure readEverything();
    /// What lies in the folder; asks once.
    [[nodiscard]] Failure readFolder(ItemId folder);
    /// The items, wherever they lie.
    [[nodiscard]] Failure readItems(const std::vector<ItemId>& items);
    /// The items whose content or folder is one of these, wherever they lie.
    [[nodiscard]] Failure readIdentities(const std::vector<FileIdentity>& identities);

    // Among what was read; what they point to stays until the end.
    const ItemState* find(ItemId item) const;
    const ItemState* at(ItemId folder, std::string_view name) const;
    /// Not of promises.
    const ItemState* ofIdentity(const FileIdentity& identity) const;
    const std::deque<ItemState>& all() const { return states_; }

private:
    void add(std::vector<ItemState> states);

    StoreContext& context_;
    bool complete_ = false;
    std::deque<ItemState> states_;
    std::set<ItemId> folders_;
    std::unordered_map<ItemId, const ItemState*> byItem_;
    std::map<std::pair<ItemId, std::string_view>, const ItemState*> byPlace_;
    std::unordered_map<FileIdentity, const ItemState*, FileIdentityHash> byIdentity_;
};

} // namespace platform
