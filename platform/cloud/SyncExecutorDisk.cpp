#include "platform/base/Text.h"
#include "platform/cloud/Arrivals.h"
#include "platform/cloud/KeptFolder.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/cloud/StoreMoves.h"
#include "platform/cloud/SyncExecutor.h"
#include "platform/cloud/SyncNames.h"
#include "platform/files/FileCoordinator.h"
#include "platform/files/PathText.h"

namespace platform {
namespace {

/// How many names are tried for what has to leave its own to another.
constexpr int namesAside = 100;

std::string joined(const std::string& folder, const std::string& name) {
    return folder.empty() ? name : folder + '/' + name;
}

} // namespace

Failure SyncExecutor::arrive(const Work& work, CancelFlag& cancel) {
    const RemoteRow& row = *work.state.remote;
    Arrivals::Spot spot;
    std::optional<std::string> folder;
    context_.queue.sync([&] {
        folder = row.place.parent == rootItem ? std::string()
                                              : context_.database.localPathOf(row.place.parent);
    });
    if (!folder)
        return std::nullopt; // its folder comes first
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
        return std::nullopt;
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

Failure SyncExecutor::moveHere(const Work& work) {
    std::optional<std::string> folder;
    context_.queue.sync([&] {
        folder = work.step.to.parent == rootItem
                     ? std::string()
                     : context_.database.localPathOf(work.step.to.parent);
    });
    if (!folder)
        return std::nullopt;
    return moveOnDisk(work.localPath, joined(*folder, work.step.to.name));
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
        place = joined(folder, name);
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
    return now && now->kind == FileKind::file && now->identity == row.identity &&
           now->size == row.size && now->modified == row.modified && now->changed == row.changed;
}

Failure SyncExecutor::keep(const Work& work) {
    FileCoordinator coordinator;
    Failure keeping;
    Failure refused = coordinator.coordinateWriting(
        Url::file(context_.pathOf(work.localPath)), WritingOptions::forDeleting,
        [&](const Url&) { context_.queue.sync([&] { keeping = keepNow(work); }); });
    return refused ? refused : keeping;
}

/// On the store's queue.
Failure SyncExecutor::keepNow(const Work& work) {
    const std::string path = context_.pathOf(work.localPath);
    const Error changed = makeError(ErrorCode::changedWhileRead, nameOf(path));
    if (context_.database.localPathOf(work.step.item) != work.localPath)
        return changed;
    Failure failure;
    if (work.state.local->promise) {
        const auto sidecar = findSidecar(std::string(folderOf(path)), nameOf(path), context_.mark);
        if (sidecar && sidecar->mark.item == work.step.item)
            failure = context_.disk.removeFile(sidecar->path);
    } else if (work.state.item.kind == ItemKind::folder) {
        const bool empty = context_.database.treeOf(work.step.item, Side::local).size() == 1;
        if (!empty)
            return std::nullopt; // what is in it is somebody's; it is planned again
        failure = context_.disk.removeFolder(path);
        // What the store does not take as an item stays the user's.
        if (failure && failure->is(ErrorCode::folderNotEmpty)) {
            const Result<std::string> kept = KeptFolder(context_).take(work.localPath, true);
            failure = kept ? Failure() : Failure(kept.error());
        }
    } else if (!isAsRecorded(work, path)) {
        return changed;
    } else {
        const Result<std::string> kept = KeptFolder(context_).take(work.localPath, false);
        failure = kept ? Failure() : Failure(kept.error());
    }
    if (failure)
        return failure;
    return context_.database.transaction([&]() -> Failure {
        context_.database.removeBase(work.step.item);
        context_.database.forgetLocalTree(work.step.item);
        return std::nullopt;
    });
}

} // namespace platform
