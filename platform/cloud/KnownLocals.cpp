#include "platform/cloud/KnownLocals.h"

namespace platform {

Failure KnownLocals::readEverything() {
    std::vector<ItemState> states;
    Failure failure;
    context_.queue.sync([&] {
        states = context_.database.localItems();
        failure = context_.database.takeFault();
    });
    complete_ = true;
    add(std::move(states));
    return failure;
}

Failure KnownLocals::readFolder(ItemId folder) {
    if (complete_ || folder == 0 || !folders_.insert(folder).second)
        return std::nullopt;
    std::vector<ItemState> states;
    Failure failure;
    context_.queue.sync([&] {
        states = context_.database.localItemsIn(folder);
        failure = context_.database.takeFault();
    });
    if (failure)
        folders_.erase(folder);
    add(std::move(states));
    return failure;
}

Failure KnownLocals::readItems(const std::vector<ItemId>& items) {
    if (complete_ || items.empty())
        return std::nullopt;
    std::vector<ItemState> states;
    Failure failure;
    context_.queue.sync([&] {
        for (const ItemId item : items)
            if (std::optional<ItemState> state = context_.database.state(item))
                states.push_back(std::move(*state));
        failure = context_.database.takeFault();
    });
    add(std::move(states));
    return failure;
}

Failure KnownLocals::readIdentities(const std::vector<FileIdentity>& identities) {
    if (complete_ || identities.empty())
        return std::nullopt;
    std::vector<ItemState> states;
    Failure failure;
    context_.queue.sync([&] {
        for (const FileIdentity& identity : identities)
            for (ItemState& state : context_.database.localItemsOf(identity))
                states.push_back(std::move(state));
        failure = context_.database.takeFault();
    });
    add(std::move(states));
    return failure;
}

void KnownLocals::add(std::vector<ItemState> states) {
    for (ItemState& each : states) {
        if (!each.local || byItem_.contains(each.item.id))
            continue;
        const ItemState& state = states_.emplace_back(std::move(each));
        byItem_.emplace(state.item.id, &state);
        byPlace_.emplace(
            std::pair(state.local->place.parent, std::string_view(state.local->place.name)),
            &state);
        if (!state.local->promise)
            byIdentity_.emplace(state.local->identity, &state);
    }
}

const ItemState* KnownLocals::find(ItemId item) const {
    const auto found = byItem_.find(item);
    return found == byItem_.end() ? nullptr : found->second;
}

const ItemState* KnownLocals::at(ItemId folder, std::string_view name) const {
    const auto found = folder == 0 ? byPlace_.end() : byPlace_.find({folder, name});
    return found == byPlace_.end() ? nullptr : found->second;
}

const ItemState* KnownLocals::ofIdentity(const FileIdentity& identity) const {
    const auto found = byIdentity_.find(identity);
    return found == byIdentity_.end() ? nullptr : found->second;
}

} // namespace platform
