#pragma once

#include "platform/cloud/StateRecords.h"

#include <map>
#include <vector>

namespace platform {

/// The three trees as far as they disagree, with what stands in the way of making them agree: the
/// folders around, and whoever has a place that is wanted. An item that is not in it is the same on
/// both sides. Immutable once made.
class SyncTrees {
public:
    explicit SyncTrees(std::vector<ItemState> items);

    /// By id.
    const std::vector<ItemState>& items() const { return items_; }
    const ItemState* find(ItemId item) const;
    const ItemState* localAt(const Place& place) const;
    const ItemState* remoteAt(const Place& place) const;
    const std::vector<const ItemState*>& localChildren(ItemId folder) const;
    const std::vector<const ItemState*>& remoteChildren(ItemId folder) const;
    bool isOnDisk(ItemId folder) const;
    bool isOnRemote(ItemId folder) const;
    /// Whether `place` is the item itself, or in it, on that side.
    bool isInside(const Place& place, ItemId item, Side side) const;

private:
    using Places = std::map<std::pair<ItemId, std::string_view>, const ItemState*>;
    using Children = std::map<ItemId, std::vector<const ItemState*>>;

    std::vector<ItemState> items_;
    Places localPlaces_; // keys lie in items_
    Places remotePlaces_;
    Children localChildren_;
    Children remoteChildren_;
};

/// What is to be looked at before anything of it is believed: the content on the disk is not the
/// one that was agreed on, or may not be.
bool isChangedHere(const ItemState& state);
/// The remote's version is another one than that which was agreed on.
bool isChangedThere(const ItemState& state);
/// Nothing is to be done for the item.
bool isAgreed(const ItemState& state);

} // namespace platform
