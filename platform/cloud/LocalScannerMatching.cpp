#include "platform/cloud/LocalScanner.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/files/PathText.h"

// Which item is which: those that moved, and those that are gone.

namespace platform {

/// A folder cannot be at two places: what has this identity is the one that was elsewhere.
const ItemState* LocalScanner::folderElsewhere(const FileIdentity& identity) {
    if (Failure failure = known_.readIdentities({identity})) {
        fault_ = std::move(failure);
        return nullptr;
    }
    const ItemState* other = known_.ofIdentity(identity);
    const bool folder = other && other->item.kind == ItemKind::folder;
    return folder && seen_.insert(other->item.id).second ? other : nullptr;
}

/// New names of files that are not at their old place.
Failure LocalScanner::matchMoved() {
    std::vector<FileIdentity> identities;
    std::vector<ItemId> promised;
    for (const Found& found : found_)
        if (found.promised != 0)
            promised.push_back(found.item);
        else if (found.item == 0 && found.attributes.kind == FileKind::file)
            identities.push_back(found.attributes.identity);
    if (Failure failure = known_.readIdentities(identities))
        return failure;
    if (Failure failure = known_.readItems(promised))
        return failure;
    for (Found& found : found_) {
        if (found.promised != 0) {
            const ItemState* const own = known_.find(found.item);
            // A copy of a promise, or of one whose content has come, is nobody's.
            if (found.moved && !(own ? claim(*own) : seen_.insert(found.item).second)) {
                found.item = -1;
                spare_.push_back(found.sidecar);
            }
            continue;
        }
        if (found.item != 0 || found.attributes.kind == FileKind::directory)
            continue;
        const ItemState* const other = known_.ofIdentity(found.attributes.identity);
        if (!other || other->item.kind != ItemKind::file || !claim(*other))
            continue;
        found.item = other->item.id;
        found.moved = true;
    }
    return std::nullopt;
}

/// Whether the item is nowhere else; from now on it is where it was found.
bool LocalScanner::claim(const ItemState& state) {
    if (seen_.contains(state.item.id))
        return false;
    if (!whole_ && !readFolders_.contains(state.local->place.parent)) {
        bool absent = false;
        context_.queue.sync([&] { absent = isStillAbsent(state.item.id); });
        if (!absent) {
            seen_.insert(state.item.id);
            return false;
        }
    }
    return seen_.insert(state.item.id).second;
}

bool LocalScanner::stands(const Found& found) const {
    const Result<FileAttributes> now =
        context_.disk.attributes(context_.pathOf(found.promised != 0 ? found.sidecar : found.path));
    return now && now->kind == found.attributes.kind &&
           now->identity == found.attributes.identity &&
           (now->kind == FileKind::directory ||
            (now->size == found.attributes.size && now->modified == found.attributes.modified &&
             now->changed == found.attributes.changed));
}

bool LocalScanner::isStillAbsent(ItemId item) const {
    const std::optional<ItemState> state = context_.database.state(item);
    if (!state || !state->local)
        return false;
    const std::optional<std::string> relative = context_.database.localPathOf(item);
    if (!relative)
        return true; // in a folder that is gone itself
    const std::string path = context_.pathOf(*relative);
    if (state->local->promise) {
        const auto sidecar =
            examineSidecar(std::string(folderOf(path)), nameOf(path), context_.mark);
        return sidecar && (!*sidecar || (*sidecar)->mark.item != item);
    }
    const Result<FileAttributes> now = context_.disk.attributes(path);
    if (!now)
        return now.error().is(ErrorCode::noSuchItem);
    return (now->kind == FileKind::directory) != (state->item.kind == ItemKind::folder);
}

/// It lies somewhere that could not be looked at.
bool LocalScanner::isUnknown(const ItemState& state) const {
    const ItemState* at = &state;
    for (std::size_t steps = 0; at && steps < known_.all().size(); ++steps) {
        if (blind_.contains(at->local->place.parent))
            return true;
        at = known_.find(at->local->place.parent);
    }
    return false;
}

void LocalScanner::collectVanished() {
    std::vector<ItemId> unagreed;
    for (const ItemState& state : known_.all()) {
        if (seen_.contains(state.item.id) || (unknownPromise_ && state.local->promise) ||
            (!whole_ && !readFolders_.contains(state.local->place.parent)) || isUnknown(state) ||
            !isStillAbsent(state.item.id))
            continue;
        if (whole_) {
            vanished_.push_back(state.item.id);
            continue;
        }
        if (state.item.kind == ItemKind::file && !state.remote && !state.base)
            unagreed.push_back(state.item.id);
        else // what lies in it went with it
            for (const ItemId item : context_.database.treeOf(state.item.id, Side::local))
                vanished_.push_back(item);
    }
    if (!unagreed.empty())
        dropUnagreed(std::move(unagreed));
}

/// What the account never had needs no look at all to be forgotten: programs make and delete such
/// files all the time, and one that turns up elsewhere is as good as new.
void LocalScanner::dropUnagreed(std::vector<ItemId> items) {
    const Failure failure = context_.database.transaction([&]() -> Failure {
        for (const ItemId item : items) {
            context_.database.removeLocal(item);
            context_.database.setItemPlace(item, std::nullopt);
        }
        return std::nullopt;
    });
    if (failure)
        vanished_.insert(vanished_.end(), items.begin(), items.end());
}

} // namespace platform
