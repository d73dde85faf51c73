#include "platform/cloud/RemoteLister.h"
#include "platform/files/PathText.h"

// Items that the remote has at another place than before, told by their identity there.

namespace platform {

std::optional<ItemState> RemoteLister::movedHere(const Visit& visit, const RemoteEntry& entry) {
    if (first_ || entry.remoteId.empty())
        return std::nullopt;
    std::optional<ItemState> state;
    std::optional<std::string> before;
    context_.queue.sync([&] {
        if (const auto item = context_.database.itemOfRemoteId(entry.remoteId)) {
            state = context_.database.state(*item);
            before = context_.database.remotePathOf(*item);
        }
    });
    if (!state || !state->remote || state->item.kind != entry.kind)
        return std::nullopt;
    if (moved_.contains(state->item.id))
        return std::nullopt; // this run has met it
    const std::string now = joinedPath(visit.folder.remotePath, entry.name);
    if (!before || *before == now)
        return state;
    const Result<RemoteEntry> there = context_.remote.entry(*before, cancel_);
    const bool left =
        there ? there->remoteId != entry.remoteId : there.error().is(ErrorCode::noSuchItem);
    return left ? state : std::nullopt; // a second name of one file is a file of its own
}

void RemoteLister::takeMoved(Visit& visit, const RemoteEntry& entry, const ItemState& state) {
    moved_.insert(state.item.id);
    if (replaced_.contains(state.item.id)) {
        again_.insert(state.remote->place.parent);
        std::erase_if(waiting_,
                      [&](const Folder& folder) { return folder.item == state.item.id; });
    }
    RemoteRow row = rowOf(visit, entry);
    ListingBatch::Change change{state.item, false, row, {}, {}};
    // A move changes the version and no content, where size and time are the same.
    if (state.base && state.remote->etag == state.base->etag && state.remote->size == entry.size &&
        state.remote->modified == entry.modified && entry.kind == ItemKind::file) {
        change.base = state.base;
        change.base->etag = entry.etag;
    }
    batch_.changes.push_back(std::move(change));
    if (entry.kind == ItemKind::folder)
        descendKnown(visit, entry, state);
}

/// The folders where something new was taken for what was there before and has moved.
void RemoteLister::listAgain() {
    depth_ = Depth::newFolders;
    moved_.clear();
    replaced_.clear();
    const std::set<ItemId> folders = std::exchange(again_, {});
    waitFor({folders.begin(), folders.end()});
}

} // namespace platform
