#include "platform/cloud/SyncTrees.h"

#include <algorithm>

namespace platform {
namespace {

template<class Places>
const ItemState* at(const Places& places, const Place& place) {
    const auto found = places.find({place.parent, place.name});
    return found == places.end() ? nullptr : found->second;
}

template<class Children>
const std::vector<const ItemState*>& of(const Children& children, ItemId folder) {
    static const std::vector<const ItemState*> none;
    const auto found = children.find(folder);
    return found == children.end() ? none : found->second;
}

} // namespace

SyncTrees::SyncTrees(std::vector<ItemState> items) : items_(std::move(items)) {
    std::sort(items_.begin(), items_.end(),
              [](const ItemState& a, const ItemState& b) { return a.item.id < b.item.id; });
    for (const ItemState& state : items_) {
        if (state.local) {
            localPlaces_.emplace(
                std::pair(state.local->place.parent, std::string_view(state.local->place.name)),
                &state);
            localChildren_[state.local->place.parent].push_back(&state);
        }
        if (state.remote) {
            remotePlaces_.emplace(
                std::pair(state.remote->place.parent, std::string_view(state.remote->place.name)),
                &state);
            remoteChildren_[state.remote->place.parent].push_back(&state);
        }
    }
}

const ItemState* SyncTrees::find(ItemId item) const {
    const auto found = std::lower_bound(
        items_.begin(), items_.end(), item,
        [](const ItemState& state, ItemId wanted) { return state.item.id < wanted; });
    return found != items_.end() && found->item.id == item ? &*found : nullptr;
}

const ItemState* SyncTrees::localAt(const Place& place) const {
    return at(localPlaces_, place);
}

const ItemState* SyncTrees::remoteAt(const Place& place) const {
    return at(remotePlaces_, place);
}

const std::vector<const ItemState*>& SyncTrees::localChildren(ItemId folder) const {
    return of(localChildren_, folder);
}

const std::vector<const ItemState*>& SyncTrees::remoteChildren(ItemId folder) const {
    return of(remoteChildren_, folder);
}

bool SyncTrees::isOnDisk(ItemId folder) const {
    const ItemState* state = find(folder);
    return folder == rootItem || !state || state->local;
}

bool SyncTrees::isOnRemote(ItemId folder) const {
    const ItemState* state = find(folder);
    return folder == rootItem || !state || state->remote;
}

bool SyncTrees::isInside(const Place& place, ItemId item, Side side) const {
    ItemId folder = place.parent;
    // A chain cannot be longer than there are items; rows of a moment between two scans may form a
    // circle.
    for (std::size_t steps = 0; steps <= items_.size() && folder != rootItem; ++steps) {
        if (folder == item)
            return true;
        const ItemState* state = find(folder);
        if (!state)
            return false;
        if (side == Side::local ? !state->local : !state->remote)
            return false;
        folder = side == Side::local ? state->local->place.parent : state->remote->place.parent;
    }
    return folder != rootItem;
}

bool isChangedHere(const ItemState& state) {
    if (state.item.kind == ItemKind::folder || !state.local || state.local->promise)
        return false;
    if (!state.base || state.base->hash.empty())
        return true;
    const LocalRow& local = *state.local;
    const BaseRow& base = *state.base;
    return local.identity != base.identity || local.size != base.size ||
           local.modified != base.modified || local.changed != base.changed;
}

bool isChangedThere(const ItemState& state) {
    return state.item.kind == ItemKind::file && state.remote &&
           (!state.base || state.base->etag != state.remote->etag);
}

bool isAgreed(const ItemState& state) {
    return state.local && state.remote && state.base && state.local->place == state.base->place &&
           state.remote->place == state.base->place && !isChangedHere(state) &&
           !isChangedThere(state);
}

} // namespace platform
