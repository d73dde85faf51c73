#include "platform/cloud/RemoteLister.h"

#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/files/PathText.h"

#include <algorithm>

namespace platform {
namespace {

/// Entries that one transaction and one sync carry: enough that both cost little an entry, few
/// enough that an interrupted listing repeats little and that the queue is free again soon.
constexpr std::size_t batchSize = 4096;
/// How often what was taken for another item is looked for anew in one run.
constexpr int passesAtMost = 3;
/// Folders that are read from the remote ahead of the one that is worked on.
constexpr unsigned foldersAhead = 2;

bool sameObservation(const RemoteRow& row, const RemoteEntry& entry) {
    return row.etag == entry.etag && row.size == entry.size && row.remoteId == entry.remoteId &&
           row.role == entry.role && row.tags == entry.tags;
}

} // namespace

bool RemoteLister::stopsEverything(const Error& error) {
    constexpr std::array codes{ErrorCode::serverNotAvailable, ErrorCode::authenticationFailed,
                               ErrorCode::userCancelled,      ErrorCode::outOfSpace,
                               ErrorCode::readOnlyVolume,     ErrorCode::databaseUnusable,
                               ErrorCode::readCorrupt,        ErrorCode::itemBusy};
    return std::any_of(codes.begin(), codes.end(), [&](ErrorCode code) { return error.is(code); });
}

RemoteLister::RemoteLister(StoreContext& context, CancelFlag& cancel, Written written)
    : context_(context),
      cancel_(cancel),
      written_(std::move(written)),
      arrivals_(context, cancel),
      readers_("listing", foldersAhead) {
}

RemoteLister::~RemoteLister() {
    readers_.waitUntilIdle();
    if (writing_.valid())
        writing_.wait(); // its job refers to this object
}

Failure RemoteLister::run(const std::vector<ItemId>& folders, Depth depth) {
    depth_ = depth;
    waitFor(folders);
    context_.queue.sync(
        [&] { first_ = !context_.database.scan(rootItem, Side::remote).complete; });
    Failure writing;
    for (int pass = 1; pass <= passesAtMost && !waiting_.empty(); ++pass) {
        writing = listWaiting();
        if (writing || firstFailure_)
            break;
        listAgain();
    }
    return firstFailure_ ? firstFailure_ : writing;
}

Failure RemoteLister::listWaiting() {
    for (readAhead(); !reading_.empty(); readAhead()) {
        Reading next = std::move(reading_.front());
        reading_.pop_front();
        const Result<RemoteListing> listing = next.listing.get();
        const Failure failure = cancel_.isCancelled() ? Failure(makeError(ErrorCode::userCancelled))
                                                      : bringIn(next.folder, listing);
        if (!failure)
            continue;
        noteFailure(next.folder, *failure);
        if (stopsEverything(*failure))
            break;
    }
    return writeAll();
}

void RemoteLister::waitFor(const std::vector<ItemId>& folders) {
    context_.queue.sync([&] {
        for (const ItemId item : folders) {
            const std::optional<std::string> remotePath = context_.database.remotePathOf(item);
            const std::optional<std::string> localPath = context_.database.localPathOf(item);
            if (remotePath)
                waiting_.push_back(
                    {item, *remotePath, localPath.value_or(""), false, false, !localPath});
        }
    });
}

void RemoteLister::noteFailure(const Folder& folder, const Error& error) {
    if (!error.is(ErrorCode::userCancelled))
        platformLog(LogLevel::warning, "cloud: cannot list “%@”: %@", folder.remotePath, error);
    if (!firstFailure_)
        firstFailure_ = error;
}

RemoteLister::Known RemoteLister::knownOf(const Folder& folder) {
    Known known;
    if (folder.unknown)
        return known;
    context_.queue.sync([&] {
        known.scan = context_.database.scan(folder.item, Side::remote);
        known.states = context_.database.childrenOf(folder.item);
    });
    for (const ItemState& state : known.states) {
        if (state.remote && state.remote->place.parent == folder.item)
            known.remote.emplace(state.remote->place.name, &state);
        if (state.item.place && state.item.place->parent == folder.item)
            known.shown.emplace(state.item.place->name, &state);
    }
    return known;
}

Result<Arrivals::Spot> RemoteLister::spotOf(const Folder& folder) {
    Arrivals::Spot spot{
        folder.item, folder.localPath, context_.pathOf(folder.localPath), folder.remotePath, {}};
    if (folder.empty || folder.recordOnly)
        return spot;
    const Result<std::vector<DirectoryEntry>> entries = context_.disk.entries(spot.path);
    if (!entries)
        return entries.error();
    for (const DirectoryEntry& entry : *entries)
        spot.names.insert(entry.name);
    return spot;
}

void RemoteLister::readAhead() {
    while (!waiting_.empty() && reading_.size() < foldersAhead) {
        auto listing = std::make_shared<std::promise<Result<RemoteListing>>>();
        reading_.push_back({std::move(waiting_.front()), listing->get_future()});
        waiting_.pop_front();
        readers_.async([this, listing, path = reading_.back().folder.remotePath] {
            listing->set_value(context_.remote.list(path, cancel_));
        });
    }
}

Failure RemoteLister::bringIn(const Folder& folder, const Result<RemoteListing>& listing) {
    // That a folder is not there any more is for the listing of the one above to say.
    if (!listing && listing.error().is(ErrorCode::noSuchItem) && folder.item != rootItem)
        return std::nullopt;
    if (!listing)
        return listing.error();
    Result<Arrivals::Spot> spot = spotOf(folder);
    if (!spot && spot.error().is(ErrorCode::noSuchItem)) { // deleted by the user a moment ago
        Folder recorded = folder;
        recorded.recordOnly = true;
        return bringIn(recorded, listing);
    }
    if (!spot)
        return spot.error();
    // One that moved while it was listed was another one before: that must be in the records.
    if (!visited_.insert(folder.item).second)
        if (Failure failure = writeAll())
            return failure;
    Visit visit{folder, knownOf(folder), std::move(*spot), 1, listing->refused};
    std::unordered_map<std::string_view, const ItemState*> missing = visit.known.remote;
    for (const RemoteEntry& entry : listing->entries)
        missing.erase(entry.name);
    std::vector<ItemId> unreadable; // there, and for now refused: that is not absent
    for (const RefusedRow& row : listing->refused)
        if (const auto known = missing.extract(row.name))
            unreadable.push_back(known.mapped()->item.id);
    visit.generation =
        std::max<std::int64_t>(1, visit.known.scan.generation + (missing.empty() ? 0 : 1));
    for (const ItemId item : unreadable)
        batch_.seen.emplace_back(item, visit.generation);
    for (const RemoteEntry& entry : listing->entries) {
        if (Failure failure = take(visit, entry))
            return failure;
        if (batch_.size() >= batchSize)
            if (Failure failure = writeDown())
                return failure;
    }
    batch_.scans.push_back({folder.item, {visit.generation, true}, std::move(visit.refused)});
    return std::nullopt;
}

Failure RemoteLister::take(Visit& visit, const RemoteEntry& entry) {
    const auto known = visit.known.remote.find(entry.name);
    if (known != visit.known.remote.end() && !moved_.contains(known->second->item.id))
        return takeKnown(visit, entry, *known->second);
    if (const std::optional<ItemState> moved = movedHere(visit, entry)) {
        takeMoved(visit, entry, *moved);
        return std::nullopt;
    }
    const auto shown = visit.known.shown.find(entry.name);
    if (shown == visit.known.shown.end())
        return takeNew(visit, entry, nullptr);
    const ItemState& state = *shown->second;
    if (state.remote || state.item.kind != entry.kind) {
        // The user sees another item under that name. This one waits until it can have a name.
        addRemoteOnly(visit, entry);
        return std::nullopt;
    }
    return takeNew(visit, entry, &state);
}

Failure RemoteLister::takeKnown(Visit& visit, const RemoteEntry& entry, const ItemState& state) {
    if (state.item.kind != entry.kind) {
        batch_.displaced.push_back(state.item.id); // another one has its place: it is not there
        if (state.item.place && state.local)
            addRemoteOnly(visit, entry);
        else
            return takeNew(visit, entry, nullptr);
        return std::nullopt;
    }
    if (!state.local && !state.base && state.item.place && !visit.folder.recordOnly)
        return takeNew(visit, entry, &state);
    if (entry.remoteId != state.remote->remoteId)
        replaced_.insert(state.item.id);
    if (entry.kind == ItemKind::folder && depth_ == Depth::everything)
        descendKnown(visit, entry, state);
    if (sameObservation(*state.remote, entry)) {
        if (state.remote->generation != visit.generation)
            batch_.seen.emplace_back(state.item.id, visit.generation);
        return std::nullopt;
    }
    ListingBatch::Change change{state.item, false, rowOf(visit, entry), {}, {}};
    if (state.base && state.local && state.local->promise && promiseStands(state)) {
        // A promise has no content of its own: the record follows the remote.
        change.base = state.base;
        change.base->etag = entry.etag;
        change.base->size = entry.size;
    } else if (Arrivals::isFetchedAtOnce(visit.spot, entry)) {
        Result<Arrivals::Outcome> renewed = arrivals_.renew(visit.spot, entry, state);
        if (!renewed)
            return renewed.error();
        change.local = std::move(renewed->local);
        change.base = std::move(renewed->base);
    }
    batch_.changes.push_back(std::move(change));
    return std::nullopt;
}

/// One that the user deleted a moment ago was one of the version before.
bool RemoteLister::promiseStands(const ItemState& state) {
    std::optional<std::string> relative;
    context_.queue.sync([&] { relative = context_.database.localPathOf(state.item.id); });
    if (!relative)
        return false;
    const std::string path = context_.pathOf(*relative);
    const auto sidecar = findSidecar(std::string(folderOf(path)), nameOf(path), context_.mark);
    return sidecar && sidecar->mark.item == state.item.id;
}

Failure RemoteLister::takeNew(Visit& visit, const RemoteEntry& entry, const ItemState* state) {
    if (visit.folder.recordOnly) {
        addRemoteOnly(visit, entry);
        return std::nullopt;
    }
    if (state && state->local) {
        // On the disk already, and not agreed on: what that means is for a plan to say.
        batch_.changes.push_back({state->item, false, rowOf(visit, entry), {}, {}});
        if (entry.kind == ItemKind::folder) {
            batch_.scans.push_back({state->item.id, {0, false}, std::nullopt});
            descendKnown(visit, entry, *state);
        }
        return std::nullopt;
    }
    Result<Arrivals::Outcome> outcome =
        arrivals_.arrive(visit.spot, entry, state ? std::optional(state->item.id) : std::nullopt);
    if (!outcome && outcome.error().is(ErrorCode::fileExists)) {
        if (!state)
            addRemoteOnly(visit, entry);
        else
            batch_.changes.push_back({state->item, false, rowOf(visit, entry), {}, {}});
        return std::nullopt;
    }
    if (!outcome)
        return outcome.error();
    if (outcome->refused) {
        visit.refused.push_back({entry.name, *outcome->refused});
        return std::nullopt;
    }
    batch_.effectsOnDisk = true;
    const ItemId item = outcome->item;
    batch_.changes.push_back({{item, entry.kind, Place{visit.folder.item, entry.name}},
                              state == nullptr,
                              rowOf(visit, entry),
                              std::move(outcome->local),
                              std::move(outcome->base)});
    if (entry.kind == ItemKind::folder) {
        batch_.scans.push_back({item, {0, false}, std::nullopt});
        waiting_.push_back({item, joinedPath(visit.folder.remotePath, entry.name),
                            joinedPath(visit.folder.localPath, entry.name), state == nullptr,
                            outcome->madeFolder, false});
    }
    return std::nullopt;
}

void RemoteLister::addRemoteOnly(Visit& visit, const RemoteEntry& entry) {
    const ItemId item = context_.database.newItemId();
    batch_.changes.push_back(
        {{item, entry.kind, std::nullopt}, true, rowOf(visit, entry), std::nullopt, std::nullopt});
    if (entry.kind == ItemKind::folder) {
        batch_.scans.push_back({item, {0, false}, std::nullopt});
        waiting_.push_back(
            {item, joinedPath(visit.folder.remotePath, entry.name), "", true, false, true});
    }
}

void RemoteLister::descendKnown(const Visit& visit, const RemoteEntry& entry,
                                const ItemState& state) {
    std::optional<std::string> localPath;
    if (state.local && state.local->place == Place{visit.folder.item, entry.name} &&
        !visit.folder.recordOnly)
        localPath = joinedPath(visit.folder.localPath, entry.name);
    else if (state.local) // moved on this device
        context_.queue.sync([&] { localPath = context_.database.localPathOf(state.item.id); });
    waiting_.push_back({state.item.id, joinedPath(visit.folder.remotePath, entry.name),
                        localPath.value_or(""), false, false, !localPath});
}

RemoteRow RemoteLister::rowOf(const Visit& visit, const RemoteEntry& entry) const {
    return {Place{visit.folder.item, entry.name},
            entry.etag,
            entry.size,
            entry.modified,
            entry.created,
            entry.remoteId,
            entry.role,
            entry.tags,
            visit.generation};
}

Failure RemoteLister::writtenSoFar() {
    return writing_.valid() ? writing_.get() : std::nullopt;
}

Failure RemoteLister::writeAll() {
    Failure failure = writeDown();
    return failure ? failure : writtenSoFar();
}

Failure RemoteLister::writeDown() {
    if (Failure failure = writtenSoFar())
        return failure;
    if (batch_.size() == 0)
        return std::nullopt;
    auto done = std::make_shared<std::promise<Failure>>();
    writing_ = done->get_future();
    auto batch = std::make_shared<ListingBatch>(std::exchange(batch_, ListingBatch()));
    batch->first = first_;
    context_.queue.async([this, done = std::move(done), batch = std::move(batch)] {
        Failure failure;
        if (batch->effectsOnDisk)
            failure = context_.disk.syncAll(context_.layout.root());
        if (!failure)
            failure = context_.database.transaction([&]() -> Failure {
                batch->writeTo(context_.database);
                return std::nullopt;
            });
        if (!failure && written_)
            written_(*batch);
        done->set_value(std::move(failure));
    });
    return std::nullopt;
}

} // namespace platform
