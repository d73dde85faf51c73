#include "platform/cloud/LocalScanner.h"

#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/cloud/KeptFolder.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/cloud/StoreMoves.h"
#include "platform/cloud/SyncNames.h"
#include "platform/cloud/SyncTimes.h"
#include "platform/files/PathText.h"

#include <algorithm>

namespace platform {
namespace {

constexpr std::string_view rootMarkName = ".pelmora-root";

std::string joined(const std::string& folder, std::string_view name) {
    return folder.empty() ? std::string(name) : folder + '/' + std::string(name);
}

/// The path of another name in the same folder.
std::string beside(const std::string& path, std::string_view name) {
    const std::size_t slash = path.rfind('/');
    return joined(slash == std::string::npos ? std::string() : path.substr(0, slash), name);
}

bool sameAsRow(const LocalRow& row, const FileAttributes& attributes) {
    return row.identity == attributes.identity && row.size == attributes.size &&
           row.modified == attributes.modified && row.changed == attributes.changed;
}

} // namespace

Failure LocalScanner::run() {
    if (readRootMark(context_.layout) != context_.mark)
        return makeErrorWithText(
            ErrorCode::databaseUnusable,
            localizedFormat(
                "The folder “%1$@” is not there. Connect its disk; nothing was changed.",
                context_.layout.root()));
    const Result<FileAttributes> root = context_.disk.attributes(context_.layout.root());
    if (!root)
        return root.error();
    device_ = root->identity.device;
    if (Failure failure = readKnown())
        return failure;
    visits_.push_back({"", rootItem});
    for (std::size_t visit = 0; visit < visits_.size(); ++visit) {
        if (cancel_.isCancelled())
            return makeError(ErrorCode::userCancelled);
        if (Failure failure = look(visit))
            return failure;
    }
    // A disk that went away in the middle leaves empty folders.
    if (readRootMark(context_.layout) != context_.mark)
        return makeError(ErrorCode::databaseUnusable, context_.layout.root());
    matchMoved();
    Failure failure;
    context_.queue.sync([&] {
        failure = writeDown();
        if (!failure && !again_)
            collectVanished();
        if (failure && again_ && failure->is(ErrorCode::changedWhileRead)) {
            platformLog(LogLevel::debug, "cloud: the disk changed under a look at it: %@",
                        *failure);
            failure.reset(); // nothing was written down
        }
    });
    for (const Visit& visit : visits_)
        folders_.push_back(visit.path);
    return failure;
}

Failure LocalScanner::readKnown() {
    Failure failure;
    context_.queue.sync([&] {
        known_ = context_.database.localItems();
        failure = context_.database.takeFault();
    });
    for (const ItemState& state : known_) {
        byItem_.emplace(state.item.id, &state);
        byPlace_.emplace(
            std::pair(state.local->place.parent, std::string_view(state.local->place.name)),
            &state);
        if (!state.local->promise)
            byIdentity_.emplace(state.local->identity, &state);
    }
    return failure;
}

const ItemState* LocalScanner::knownAt(ItemId folder, std::string_view name) const {
    const auto found = folder == 0 ? byPlace_.end() : byPlace_.find({folder, name});
    return found == byPlace_.end() ? nullptr : found->second;
}

Failure LocalScanner::look(std::size_t visit) {
    const std::string path = visits_[visit].path;
    const Result<std::vector<DirectoryEntry>> entries =
        context_.disk.entries(context_.pathOf(path));
    if (!entries) {
        if (path.empty())
            return entries.error();
        platformLog(LogLevel::warning, "cloud: cannot look into “%@”: %@", path, entries.error());
        blind_.insert(visits_[visit].item); // a notice tells when it can be read again
        return std::nullopt;
    }
    for (const DirectoryEntry& entry : *entries)
        take(visit, entry);
    return std::nullopt;
}

void LocalScanner::refuse(std::size_t visit, const std::string& name, std::string reason) {
    refused_.emplace_back(visit, RefusedRow{name, std::move(reason)});
}

void LocalScanner::take(std::size_t visit, const DirectoryEntry& entry) {
    const Visit in = visits_[visit];
    if (in.path.empty() && entry.name == rootMarkName)
        return;
    const std::string path = joined(in.path, entry.name);
    const Result<FileAttributes> attributes = context_.disk.attributes(context_.pathOf(path));
    const ItemState* known = knownAt(in.item, entry.name);
    if (!attributes) {
        if (!attributes.error().is(ErrorCode::noSuchItem) && known) { // unknown
            seen_.insert(known->item.id);
            blind_.insert(known->item.id);
        } else if (!attributes.error().is(ErrorCode::noSuchItem) && hasSidecarForm(entry.name)) {
            noteUnknownPromise(entry.name, attributes.error());
        }
        if (attributes.error().is(ErrorCode::noSuchItem))
            lookAfter(settleTime);
        return;
    }
    if (attributes->kind == FileKind::symbolicLink)
        return refuse(visit, entry.name, localized("It is a symbolic link."));
    if (attributes->kind == FileKind::other)
        return refuse(visit, entry.name, localized("It is neither a file nor a folder."));
    if (attributes->identity.device != device_) {
        if (known) {
            seen_.insert(known->item.id);
            blind_.insert(known->item.id);
        }
        return refuse(visit, entry.name, localized("It lies on another disk than the store."));
    }
    const bool folder = attributes->kind == FileKind::directory;
    if (!folder && hasSidecarForm(entry.name))
        return takeSidecar(visit, entry.name, *attributes);
    Found found{path, {}, *attributes, 0, 0, visit, false, SIZE_MAX};
    // The folder of that place may have been met elsewhere already; then this is a new one.
    const bool elsewhere = folder && known && seen_.contains(known->item.id);
    if (known && !elsewhere && (known->item.kind == ItemKind::folder) == folder) {
        found.item = known->item.id;
        seen_.insert(found.item);
        const bool same = !known->local->promise && sameAsRow(*known->local, *attributes);
        if (same && !folder && !isYoung(attributes->modified, context_.clock.now())) {
            return;
        }
        if (folder && known->local->identity == attributes->identity) {
            visits_.push_back({path, found.item});
            return;
        }
    } else if (folder) {
        // A folder cannot be at two places: this is the one that was elsewhere.
        const auto other = byIdentity_.find(attributes->identity);
        if (other != byIdentity_.end() && other->second->item.kind == ItemKind::folder &&
            seen_.insert(other->second->item.id).second) {
            found.item = other->second->item.id;
            found.moved = true;
        }
    }
    note(std::move(found), visit, folder);
}

void LocalScanner::lookAfter(Duration delay) {
    settlesIn_ = std::max(settlesIn_.value_or(delay), delay);
}

void LocalScanner::note(Found found, std::size_t visit, bool isFolder) {
    found.folder = visit;
    if (!isFolder && isYoung(found.attributes.modified, context_.clock.now()))
        lookAfter(settleTimeOf(found.attributes.modified));
    if (isFolder) {
        found.opens = visits_.size();
        visits_.push_back({found.path, found.item});
    }
    found_.push_back(std::move(found));
}

/// Whose it is only its mark would tell: until it can be read no promise counts as gone.
void LocalScanner::noteUnknownPromise(const std::string& name, const Error& error) {
    platformLog(LogLevel::warning, "cloud: cannot read the promise “%@”: %@", name, error);
    unknownPromise_ = true;
}

void LocalScanner::takeSidecar(std::size_t visit, const std::string& name,
                               const FileAttributes& attributes) {
    const Visit in = visits_[visit];
    const std::string path = joined(in.path, name);
    const Result<std::optional<SidecarMark>> read =
        examineMark(context_.pathOf(path), context_.mark);
    if (!read)
        return noteUnknownPromise(name, read.error());
    const std::optional<SidecarMark>& mark = *read;
    if (!mark && isHalfWritten(context_.pathOf(path), context_.mark)) {
        halfWritten_.push_back(path);
        return;
    }
    if (!mark)
        return refuse(
            visit, name,
            localized("Names that begin with “.” and end in “.promise” are kept for promises."));
    const std::string document = promisedName(name, *mark);
    const ItemState* known = knownAt(in.item, document);
    if (known && known->item.id == mark->item) {
        if (!known->local->promise) {
            spare_.push_back(path);
            return;
        }
        seen_.insert(mark->item);
        if (sameAsRow(*known->local, attributes))
            return;
    }
    note({joined(in.path, document), path, attributes, mark->item, mark->item, visit,
          !known || known->item.id != mark->item, SIZE_MAX},
         visit, false);
}

/// New names of files that are not at their old place.
void LocalScanner::matchMoved() {
    for (Found& found : found_) {
        if (found.promised != 0) {
            // A copy of a promise, or of one whose content has come, is nobody's.
            if (found.moved && !seen_.insert(found.item).second) {
                found.item = -1;
                spare_.push_back(found.sidecar);
            }
            continue;
        }
        if (found.item != 0 || found.attributes.kind == FileKind::directory)
            continue;
        const auto other = byIdentity_.find(found.attributes.identity);
        if (other == byIdentity_.end() || other->second->item.kind != ItemKind::file ||
            !seen_.insert(other->second->item.id).second)
            continue;
        found.item = other->second->item.id;
        found.moved = true;
    }
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

Failure LocalScanner::writeDown() {
    // Whatever they are, they are not thrown away.
    for (const std::string& path : halfWritten_) {
        const Result<std::optional<SidecarMark>> mark =
            examineMark(context_.pathOf(path), context_.mark);
        if (mark && !*mark && isHalfWritten(context_.pathOf(path), context_.mark))
            if (const auto kept = KeptFolder(context_).take(path, true); !kept)
                platformLog(LogLevel::warning, "cloud: cannot put %@ away: %@", path, kept.error());
    }
    if (found_.empty() && refused_.empty() && spare_.empty() &&
        context_.database.refusedCount(Side::local) == 0)
        return std::nullopt;
    Failure failure = context_.database.transaction([&]() -> Failure {
        // All that moved leave their places before anybody takes one.
        for (const Found& found : found_)
            if (found.moved && found.item > 0 && context_.database.state(found.item) &&
                stands(found)) {
                context_.database.removeLocal(found.item);
                context_.database.setItemPlace(found.item, std::nullopt);
            }
        for (Found& found : found_)
            if (Failure writing = write(found))
                return writing;
        std::map<ItemId, std::vector<RefusedRow>> refused;
        for (const auto& [visit, row] : refused_)
            if (visits_[visit].item > 0)
                refused[visits_[visit].item].push_back(row);
        context_.database.clearRefused(Side::local);
        for (const auto& [folder, rows] : refused)
            context_.database.setRefused(folder, Side::local, rows);
        return std::nullopt;
    });
    if (!failure)
        removeSpareSidecars();
    return failure;
}

Failure LocalScanner::write(Found& found) {
    StateDatabase& database = context_.database;
    const ItemId parent = visits_[found.folder].item;
    if (found.item < 0)
        return std::nullopt;
    const Error late = makeError(ErrorCode::changedWhileRead, nameOf(found.path));
    if (parent <= 0 || !stands(found)) {
        again_ = true;
        // One that has left its place already must get one; all others are found by another look.
        return found.moved ? Failure(late) : std::nullopt;
    }
    const bool folder = found.attributes.kind == FileKind::directory;
    const std::optional<ItemState> state =
        found.item != 0 ? database.state(found.item) : std::optional<ItemState>();
    if (const std::optional<ItemId> other =
            database.localItemAt({parent, std::string(nameOf(found.path))});
        other && *other != found.item) {
        const std::optional<ItemState> before = database.state(*other);
        if (unknownPromise_ && !seen_.contains(*other) && before && before->local &&
            before->local->promise) { // it may be there still
            again_ = true;
            return found.moved ? Failure(late) : std::nullopt;
        }
        if (!seen_.contains(*other)) {
            database.removeLocal(*other); // its place is another's
            database.setItemPlace(*other, std::nullopt);
        } else if (Failure failure = moveAside(found, *other)) {
            return failure;
        }
    }
    const Place place{parent, std::string(nameOf(found.path))};
    if (!state) {
        if (found.item == 0)
            found.item = database.newItemId();
        writeNew(found, place, folder);
    } else {
        if (const std::optional<ItemId> shown = database.itemAt(place);
            shown && *shown != found.item)
            database.setItemPlace(*shown, std::nullopt);
        database.setItemPlace(found.item, place);
        database.putLocal(found.item, localRowOf(place, found.attributes, found.promised != 0));
        // A file of the user's over a promise: they have not seen what it promised, so that nothing
        // is agreed on, and a deletion of theirs is not one of that.
        if (found.promised == 0 && state->local && state->local->promise)
            database.removeBase(found.item);
        if (found.promised == 0 && state->local && state->local->promise)
            if (const std::optional<FoundSidecar> sidecar = findSidecar(
                    std::string(folderOf(context_.pathOf(found.path))), place.name, context_.mark);
                sidecar && sidecar->mark.item == found.item)
                spare_.push_back(sidecar->path.substr(context_.layout.root().size() + 1));
    }
    if (found.opens != SIZE_MAX)
        visits_[found.opens].item = found.item;
    return std::nullopt;
}

Failure LocalScanner::moveAside(Found& found, ItemId owner) {
    if (found.promised != 0)
        return movePromiseAside(found);
    const std::optional<ItemState> other = context_.database.state(owner);
    const std::string path = context_.pathOf(found.path);
    const std::string folder(folderOf(path));
    const auto sidecar = findSidecar(folder, nameOf(path), context_.mark);
    if (!other || !other->local || !other->local->promise || !sidecar ||
        sidecar->mark.item != owner) {
        again_ = true;
        return makeError(ErrorCode::changedWhileRead, nameOf(path));
    }
    const ItemKind kind =
        found.attributes.kind == FileKind::directory ? ItemKind::folder : ItemKind::file;
    Failure failure;
    for (int number = 1; number <= namesAside; ++number) {
        const std::string name =
            conflictName(nameOf(path), kind, context_.clock.now(), deviceName(), number);
        if (findSidecar(folder, name, context_.mark))
            continue;
        failure = context_.disk.rename(path, folder + '/' + name);
        if (failure && failure->is(ErrorCode::fileExists))
            continue;
        if (failure)
            return failure;
        found.path = beside(found.path, name);
        const Result<FileAttributes> now = context_.disk.attributes(context_.pathOf(found.path));
        if (!now)
            return now.error();
        found.attributes = *now;
        again_ = true; // what is in it is to be found there
        return std::nullopt;
    }
    return failure ? failure : makeError(ErrorCode::fileExists, nameOf(path));
}

/// The promise came to a name that something else has.
Failure LocalScanner::movePromiseAside(Found& found) {
    const std::string sidecar = context_.pathOf(found.sidecar);
    const std::string folder(folderOf(sidecar));
    const Result<std::optional<SidecarMark>> mark = examineMark(sidecar, context_.mark);
    again_ = true;
    if (!mark || !*mark)
        return makeError(ErrorCode::changedWhileRead, nameOf(found.path));
    Failure failure = makeError(ErrorCode::fileExists, nameOf(found.path));
    for (int number = 1; number <= namesAside; ++number) {
        const std::string name = conflictName(nameOf(found.path), ItemKind::file,
                                              context_.clock.now(), deviceName(), number);
        if (context_.disk.attributes(folder + '/' + name) ||
            findSidecar(folder, name, context_.mark))
            continue;
        const Result<FoundSidecar> moved =
            StoreMoves(context_).renameSidecar({sidecar, **mark}, folder, name);
        if (!moved)
            return moved.error();
        const Result<FileAttributes> now = context_.disk.attributes(moved->path);
        if (!now)
            return now.error();
        found.path = beside(found.path, name);
        found.sidecar = beside(found.sidecar, nameOf(moved->path));
        found.attributes = *now;
        return std::nullopt;
    }
    return failure;
}

void LocalScanner::writeNew(const Found& found, const Place& place, bool folder) {
    StateDatabase& database = context_.database;
    if (const std::optional<ItemId> shown = database.itemAt(place))
        database.setItemPlace(*shown, std::nullopt);
    database.insertItem({found.item, folder ? ItemKind::folder : ItemKind::file, place});
    database.putLocal(found.item, localRowOf(place, found.attributes, found.promised != 0));
}

/// A promise whose content is there, or that is there twice, promises nothing any more.
void LocalScanner::removeSpareSidecars() {
    for (const std::string& relative : spare_) {
        const std::string path = context_.pathOf(relative);
        const std::optional<SidecarMark> mark = readMark(path, context_.mark);
        const std::optional<ItemState> state =
            mark ? context_.database.state(mark->item) : std::optional<ItemState>();
        // It may have been evicted since, and then this is all that is left of it here.
        if (!state || !state->local || !standsElsewhere(*state, path))
            continue;
        if (const Failure failure = context_.disk.removeFile(path))
            platformLog(LogLevel::warning, "cloud: cannot remove the promise %@: %@", path,
                        *failure);
    }
}

/// The item has its content, or another promise, at the place that it is known at.
bool LocalScanner::standsElsewhere(const ItemState& state, const std::string& sidecar) const {
    const std::optional<std::string> relative = context_.database.localPathOf(state.item.id);
    if (!relative)
        return false;
    const std::string path = context_.pathOf(*relative);
    if (!state.local->promise) {
        const Result<FileAttributes> own = context_.disk.attributes(path);
        return own && own->identity == state.local->identity;
    }
    const auto own = findSidecar(std::string(folderOf(path)), nameOf(path), context_.mark);
    return own && own->mark.item == state.item.id && own->path != sidecar;
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

void LocalScanner::collectVanished() {
    for (const ItemState& state : known_) {
        if (seen_.contains(state.item.id) || (unknownPromise_ && state.local->promise))
            continue;
        bool unknown = false;
        const ItemState* at = &state;
        for (std::size_t steps = 0; at && steps < known_.size() && !unknown; ++steps) {
            unknown = blind_.contains(at->local->place.parent);
            const auto above = byItem_.find(at->local->place.parent);
            at = above == byItem_.end() ? nullptr : above->second;
        }
        if (!unknown && isStillAbsent(state.item.id))
            vanished_.push_back(state.item.id);
    }
}

} // namespace platform
