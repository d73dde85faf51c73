#include "platform/base/Text.h"
#include "platform/cloud/Arrivals.h"
#include "platform/cloud/KeptFolder.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/cloud/StoreMoves.h"
#include "platform/cloud/SyncExecutor.h"
#include "platform/cloud/SyncNames.h"
#include "platform/files/FileCoordinator.h"
#include "platform/files/PathText.h"

#include <algorithm>

namespace platform {
namespace {

/// Whoever wrote the row saw this content, wherever it lies now.
bool isContentOf(const LocalRow& row, const FileAttributes& attributes) {
    return attributes.kind == FileKind::file && attributes.identity == row.identity &&
           attributes.size == row.size && attributes.modified == row.modified;
}

} // namespace

Failure SyncExecutor::arrive(Work& work, CancelFlag& cancel) {
    const RemoteRow& row = *work.state.remote;
    Arrivals::Spot spot;
    std::optional<std::string> folder;
    context_.queue.sync([&] {
        folder = row.place.parent == rootItem ? std::string()
                                              : context_.database.localPathOf(row.place.parent);
    });
    if (!folder)
        return leaveOut(work); // its folder comes first
    spot.folder = row.place.parent;
    spot.relative = *folder;
    spot.path = context_.pathOf(*folder);
    spot.remotePath = std::string(
        work.remotePath.find('/') == std::string::npos ? "" : folderOf(work.remotePath));
    if (context_.disk.attributes(spot.path + '/' + row.place.name))
        return makeError(ErrorCode::fileExists, row.place.name); // a look at the disk tells whose
    const RemoteEntry entry{
        row.place.name, work.state.item.kind, row.size, row.modified, row.created, row.etag,
        false,          row.remoteId,         row.role, row.tags};
    const Result<Arrivals::Outcome> outcome =
        Arrivals(context_, cancel).arrive(spot, entry, work.step.item);
    if (!outcome)
        return outcome.error();
    if (outcome->refused)
        return makeErrorWithText(ErrorCode::invalidFilename, *outcome->refused);
    if (!outcome->local || outcome->item != work.step.item)
        return leaveOut(work);
    Failure failure;
    context_.queue.sync([&] {
        failure = context_.database.transaction([&]() -> Failure {
            context_.database.setItemPlace(work.step.item, row.place);
            context_.database.putLocal(work.step.item, *outcome->local);
            return std::nullopt;
        });
    });
    if (!failure && outcome->base)
        agreeLater(work.step.item, *outcome->base);
    return failure;
}

Failure SyncExecutor::moveOnDisk(const std::string& from, const std::string& to) {
    FileCoordinator coordinator;
    Failure moving;
    Failure refused = coordinator.coordinateWriting(
        Url::file(context_.pathOf(from)), WritingOptions::forMoving, Url::file(context_.pathOf(to)),
        WritingOptions::forReplacing, [&](const Url& source, const Url& target) {
            coordinator.itemAtURLWillMoveToURL(source, target);
            context_.queue.sync([&] { moving = StoreMoves(context_).move(source, target); });
            if (!moving)
                coordinator.itemAtURLDidMoveToURL(source, target);
        });
    return refused ? refused : moving;
}

Failure SyncExecutor::moveHere(Work& work) {
    std::optional<std::string> folder;
    context_.queue.sync([&] {
        folder = work.step.to.parent == rootItem
                     ? std::string()
                     : context_.database.localPathOf(work.step.to.parent);
    });
    if (!folder)
        return leaveOut(work);
    return moveOnDisk(work.localPath, joinedPath(*folder, work.step.to.name));
}

Failure SyncExecutor::moveAside(const Work& work, std::string& place,
                                const std::function<Failure(const std::string& name)>& before) {
    const std::size_t slash = work.localPath.rfind('/');
    const std::string folder =
        slash == std::string::npos ? std::string() : work.localPath.substr(0, slash);
    Failure failure;
    for (int number = 1; number <= namesAside; ++number) {
        const std::string name = conflictName(nameOf(work.localPath), work.state.item.kind,
                                              context_.clock.now(), deviceName(), number);
        place = joinedPath(folder, name);
        if (context_.disk.attributes(context_.pathOf(place)))
            continue;
        if (Failure noting = before(name))
            return noting;
        failure = moveOnDisk(work.localPath, place);
        if (!failure || !failure->is(ErrorCode::fileExists))
            return failure;
    }
    return failure ? failure : makeError(ErrorCode::fileExists, nameOf(place));
}

bool SyncExecutor::isAsRecorded(const Work& work, const std::string& path) {
    const Result<FileAttributes> now = context_.disk.attributes(path);
    const LocalRow& row = *work.state.local;
    return now && isContentOf(row, *now) && now->changed == row.changed;
}

Failure SyncExecutor::keepFileNow(const Work& work, const std::string& path) {
    const Error changed = makeError(ErrorCode::changedWhileRead, nameOf(path));
    if (!isAsRecorded(work, path))
        return changed;
    KeptFolder kept(context_);
    const Result<std::string> taken = kept.take(work.localPath, false);
    if (!taken)
        return taken.error();
    const Result<FileAttributes> now = context_.disk.attributes(*taken);
    if (now && isContentOf(*work.state.local, *now))
        return std::nullopt;
    // Somebody saved in the last moment: an edit beats a deletion.
    if (context_.disk.rename(*taken, path))
        if (const auto unsent = kept.takeFrom(*taken, work.localPath, true); !unsent)
            return unsent.error();
    return changed;
}

/// Empty, or with nothing in it but what the store does not take as items: that stays the user's.
Failure SyncExecutor::keepFolderNow(Work& work, const std::string& path) {
    if (context_.database.treeOf(work.step.item, Side::local).size() != 1)
        return leaveOut(work); // what is in it is somebody's; it is planned again
    const Failure failure = context_.disk.removeFolder(path);
    if (!failure || !failure->is(ErrorCode::folderNotEmpty))
        return failure;
    if (!holdsNoItem(work.step.item, path))
        return makeError(ErrorCode::changedWhileRead, nameOf(path));
    const Result<std::string> kept = KeptFolder(context_).take(work.localPath, true);
    return kept ? Failure() : Failure(kept.error());
}

bool SyncExecutor::holdsNoItem(ItemId folder, const std::string& path) {
    const Result<std::vector<DirectoryEntry>> entries = context_.disk.entries(path);
    if (!entries)
        return false;
    std::set<std::string> refused;
    for (const RefusedRow& row : context_.database.refused(folder, Side::local))
        refused.insert(row.name);
    return std::all_of(entries->begin(), entries->end(), [&](const DirectoryEntry& entry) {
        return refused.contains(entry.name) || isSpareCopy(path + '/' + entry.name);
    });
}

/// Of a promise that is where the records have it, or of an item that is forgotten.
bool SyncExecutor::isSpareCopy(const std::string& sidecar) {
    const std::optional<SidecarMark> mark = readMark(sidecar, context_.mark);
    if (!mark)
        return false;
    if (!context_.database.state(mark->item))
        return true;
    const std::optional<std::string> own = context_.database.localPathOf(mark->item);
    if (!own)
        return false;
    const std::string document = context_.pathOf(*own);
    const auto found =
        findSidecar(std::string(folderOf(document)), nameOf(document), context_.mark);
    return found && found->mark.item == mark->item && found->path != sidecar;
}

Failure SyncExecutor::keep(Work& work) {
    FileCoordinator coordinator;
    Failure keeping;
    Failure refused = coordinator.coordinateWriting(
        Url::file(context_.pathOf(work.localPath)), WritingOptions::forDeleting,
        [&](const Url&) { context_.queue.sync([&] { keeping = keepNow(work); }); });
    return refused ? refused : keeping;
}

/// On the store's queue.
Failure SyncExecutor::keepNow(Work& work) {
    const std::string path = context_.pathOf(work.localPath);
    const Error changed = makeError(ErrorCode::changedWhileRead, nameOf(path));
    if (context_.database.localPathOf(work.step.item) != work.localPath)
        return changed;
    Failure failure;
    if (work.state.local->promise) {
        const auto sidecar =
            examineSidecar(std::string(folderOf(path)), nameOf(path), context_.mark);
        if (!sidecar)
            return sidecar.error();
        if (*sidecar && (*sidecar)->mark.item == work.step.item)
            failure = context_.disk.removeFile((*sidecar)->path);
    } else if (work.state.item.kind == ItemKind::folder) {
        failure = keepFolderNow(work, path);
    } else {
        failure = keepFileNow(work, path);
    }
    if (failure || work.leftOut)
        return failure;
    return context_.database.transaction([&]() -> Failure {
        context_.database.removeBase(work.step.item);
        context_.database.forgetLocalTree(work.step.item);
        return std::nullopt;
    });
}

} // namespace platform
