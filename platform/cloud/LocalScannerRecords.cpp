#include "platform/base/Log.h"
#include "platform/cloud/KeptFolder.h"
#include "platform/cloud/LocalScanner.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/cloud/StoreMoves.h"
#include "platform/cloud/SyncNames.h"
#include "platform/files/PathText.h"

// What was found goes into the records, on the store's queue.

namespace platform {
namespace {

/// The path of another name in the same folder.
std::string beside(const std::string& path, std::string_view name) {
    const std::size_t slash = path.rfind('/');
    return (slash == std::string::npos ? std::string() : path.substr(0, slash + 1)) +
           std::string(name);
}

Error late(const std::string& path) {
    return makeError(ErrorCode::changedWhileRead, nameOf(path));
}

} // namespace

/// Whatever they are, they are not thrown away.
void LocalScanner::keepHalfWritten() {
    for (const std::string& path : halfWritten_) {
        const Result<std::optional<SidecarMark>> mark =
            examineMark(context_.pathOf(path), context_.mark);
        if (mark && !*mark && isHalfWritten(context_.pathOf(path), context_.mark))
            if (const auto kept = KeptFolder(context_).take(path, true); !kept)
                platformLog(LogLevel::warning, "cloud: cannot put %@ away: %@", path, kept.error());
    }
}

Failure LocalScanner::writeDown() {
    keepHalfWritten();
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
        writeRefused();
        return std::nullopt;
    });
    if (!failure)
        removeSpareSidecars();
    return failure;
}

void LocalScanner::writeRefused() {
    std::map<ItemId, std::vector<RefusedRow>> refused;
    for (const Visit& visit : visits_)
        if (!whole_ && visit.read && visit.item > 0)
            refused[visit.item]; // nothing is left of what was refused there before
    for (const auto& [visit, row] : refused_)
        if (visits_[visit].item > 0)
            refused[visits_[visit].item].push_back(row);
    if (whole_)
        context_.database.clearRefused(Side::local);
    for (const auto& [folder, rows] : refused)
        context_.database.setRefused(folder, Side::local, rows);
}

Failure LocalScanner::write(Found& found) {
    StateDatabase& database = context_.database;
    const ItemId parent = visits_[found.folder].item;
    if (found.item < 0)
        return std::nullopt;
    if (parent <= 0 || !stands(found)) {
        again_ = true;
        // One that has left its place already must get one; all others are found by another look.
        return found.moved ? Failure(late(found.path)) : std::nullopt;
    }
    const std::optional<ItemState> state =
        found.item != 0 ? database.state(found.item) : std::optional<ItemState>();
    if (const std::optional<ItemId> other =
            database.localItemAt({parent, std::string(nameOf(found.path))});
        other && *other != found.item) {
        if (Failure failure = clearPlace(found, *other))
            return failure;
        if (again_ && database.localItemAt({parent, std::string(nameOf(found.path))}) == other)
            return std::nullopt;
    }
    const Place place{parent, std::string(nameOf(found.path))};
    if (!state) {
        if (found.item == 0)
            found.item = database.newItemId();
        writeNew(found, place, found.attributes.kind == FileKind::directory);
    } else {
        writeKnown(found, *state, place);
    }
    if (found.opens != SIZE_MAX)
        visits_[found.opens].item = found.item;
    return std::nullopt;
}

/// Another item is written down for the place: one that is gone leaves it. Where that cannot be
/// told yet it keeps the place, and `again_` says so.
Failure LocalScanner::clearPlace(Found& found, ItemId other) {
    StateDatabase& database = context_.database;
    if (seen_.contains(other))
        return moveAside(found, other);
    const std::optional<ItemState> before = database.state(other);
    const bool mayBeThere = unknownPromise_ && before && before->local && before->local->promise;
    // Of one that the account has, a look at some folders cannot tell that it is nowhere.
    wantsAll_ = wantsAll_ || (!whole_ && before && (before->remote || before->base));
    if (mayBeThere || wantsAll_) {
        again_ = true;
        return found.moved ? Failure(late(found.path)) : std::nullopt;
    }
    database.removeLocal(other); // its place is another's
    database.setItemPlace(other, std::nullopt);
    // Whoever puts something where a promise was need not know of it, and records of yesterday do
    // not know what came after it: neither is a deletion.
    if ((before && before->local && before->local->promise) ||
        !database.meta(restoredKey).empty())
        database.removeBase(other);
    return std::nullopt;
}

void LocalScanner::writeKnown(const Found& found, const ItemState& state, const Place& place) {
    StateDatabase& database = context_.database;
    if (const std::optional<ItemId> shown = database.itemAt(place); shown && *shown != found.item)
        database.setItemPlace(*shown, std::nullopt);
    database.setItemPlace(found.item, place);
    database.putLocal(found.item, localRowOf(place, found.attributes, found.promised != 0));
    if (found.promised != 0 || !state.local || !state.local->promise)
        return;
    // A file of the user's over a promise: they have not seen what it promised, so that nothing is
    // agreed on, and a deletion of theirs is not one of that.
    database.removeBase(found.item);
    const std::string path = context_.pathOf(found.path);
    const auto sidecar = findSidecar(std::string(folderOf(path)), place.name, context_.mark);
    if (sidecar && sidecar->mark.item == found.item)
        spare_.push_back(sidecar->path.substr(context_.layout.root().size() + 1));
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

} // namespace platform
