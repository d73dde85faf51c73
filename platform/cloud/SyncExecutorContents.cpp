#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/cloud/ContentHash.h"
#include "platform/cloud/KeptFolder.h"
#include "platform/cloud/RateLimiter.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/cloud/SyncExecutor.h"
#include "platform/cloud/Tokens.h"
#include "platform/cloud/TransferActivity.h"
#include "platform/files/FileCoordinator.h"
#include "platform/files/PathText.h"

namespace platform {
namespace {

constexpr const char* replacementKind = "replace";
constexpr const char* conflictKind = "conflict";
/// What the engine does not take of a disk on its own.
constexpr std::uint64_t reservedBytes = std::uint64_t{200} * 1024 * 1024;

} // namespace

bool isReplacement(const OpRow& op) {
    return op.kind == replacementKind;
}

void resumeReplacement(StoreContext& context, const OpRow& op) {
    // Whatever lies there is either what came, and comes again, or what was replaced.
    const std::string staged = context.layout.staging() + '/' + op.staged;
    const std::optional<std::string> relative = context.database.pathOf(op.item);
    if (context.disk.attributes(staged)) {
        CancelFlag never;
        const Result<LocalContent> content = readLocalContent(context.disk, staged, never);
        if (!content || content->hash != op.hash) {
            const Result<std::string> kept =
                KeptFolder(context).takeFrom(staged, relative.value_or(op.staged), true);
            if (!kept) {
                platformLog(LogLevel::error, "cloud: cannot keep %@: %@", staged, kept.error());
                return;
            }
        }
    }
    const Failure ignored = context.database.transaction([&]() -> Failure {
        context.database.removeOperation(op.id);
        return std::nullopt;
    });
}

Result<SyncExecutor::Staged> SyncExecutor::stage(const Work& work, CancelFlag& cancel) {
    const std::uint64_t size = work.state.remote->size;
    const Result<std::uint64_t> free = context_.disk.freeBytes(context_.layout.staging());
    if (free && *free < size + reservedBytes)
        return makeError(ErrorCode::outOfSpace, nameOf(work.remotePath));
    Staged staged{hexText(static_cast<std::uint64_t>(work.step.item)) + '-' +
                      hexText(randomBytes(6)),
                  {},
                  {}};
    const std::string path = context_.layout.staging() + '/' + staged.name;
    Result<std::unique_ptr<StagedFile>> file = context_.disk.stage(path, size);
    if (!file)
        return file.error();
    ContentHash hash;
    std::uint64_t received = 0;
    TransferActivity::Entry shown(context_.activity, work.localPath, false, size);
    const auto sink = [&](std::span<const std::byte> piece) -> Failure {
        while (!piece.empty()) {
            const auto part = piece.first(std::min(limiter_.largestPortion(), piece.size()));
            if (!limiter_.take(part.size(), cancel))
                return makeError(ErrorCode::userCancelled);
            if (Failure failure = (*file)->write(part))
                return failure;
            hash.add(part);
            received += part.size();
            shown.setDone(received);
            piece = piece.subspan(part.size());
        }
        return std::nullopt;
    };
    const Result<RemoteEntry> version = context_.remote.read(work.remotePath, sink, cancel);
    Failure failure = version ? Failure() : Failure(version.error());
    if (!failure && (received != version->size || isCutShort(*version, *work.state.remote)))
        failure = makeError(ErrorCode::changedWhileRead, version->name);
    if (!failure)
        failure = (*file)->finish(version->modified, version->tags);
    if (!failure)
        failure = (*file)->sync();
    if (failure) {
        discard(staged);
        return *failure;
    }
    staged.version = *version;
    staged.hash = hash.finish();
    return staged;
}

void SyncExecutor::discard(const Staged& staged) {
    const std::string path = context_.layout.staging() + '/' + staged.name;
    if (const Failure failure = context_.disk.removeFile(path))
        platformLog(LogLevel::warning, "cloud: cannot remove %@: %@", path, *failure);
}

Failure SyncExecutor::download(const Work& work, CancelFlag& cancel) {
    const Result<Staged> staged = stage(work, cancel);
    if (!staged)
        return staged.error();
    if (!isChangedHere(work.state) && staged->hash == work.state.base->hash)
        return takeVersion(work, *staged);
    return replace(work, *staged);
}

/// Another version of the content that was agreed on: other rights, or another date.
Failure SyncExecutor::takeVersion(const Work& work, const Staged& staged) {
    discard(staged);
    BaseRow base = *work.state.base;
    base.etag = staged.version.etag;
    base.place = work.state.remote->place;
    Failure failure;
    context_.queue.sync([&] {
        failure = context_.database.transaction([&]() -> Failure {
            context_.database.putRemote(
                work.step.item, rowOf(work.state.remote->place, staged.version, work.state));
            return std::nullopt;
        });
    });
    if (!failure)
        agreeLater(work.step.item, std::move(base));
    return failure;
}

Failure SyncExecutor::reconcile(const Work& work, CancelFlag& cancel) {
    const std::string path = context_.pathOf(work.localPath);
    const Result<LocalContent> ours = readLocalContent(context_.disk, path, cancel);
    if (!ours)
        return ours.error();
    if (work.state.base && !work.state.base->hash.empty() && ours->hash == work.state.base->hash)
        return refreshBase(work, ours->attributes);
    const Result<Staged> theirs = stage(work, cancel);
    if (!theirs)
        return theirs.error();
    if (work.state.base && theirs->hash == work.state.base->hash)
        return takeVersion(work, *theirs); // only ours is new
    if (theirs->hash != ours->hash)
        return keepBoth(work, *theirs);
    discard(*theirs);
    const Place place = work.state.remote->place;
    Failure failure;
    context_.queue.sync([&] {
        failure = context_.database.transaction([&]() -> Failure {
            context_.database.putRemote(work.step.item, rowOf(place, theirs->version, work.state));
            context_.database.putLocal(
                work.step.item, localRowOf(work.state.local->place, ours->attributes, false));
            return std::nullopt;
        });
    });
    if (!failure)
        agreeLater(work.step.item, baseRowOf(place, theirs->version.etag, ours->attributes.size,
                                             ours->hash, ours->attributes));
    return failure;
}

Failure SyncExecutor::replace(const Work& work, const Staged& staged) {
    FileCoordinator coordinator;
    Failure replacing;
    Failure refused = coordinator.coordinateWriting(
        Url::file(context_.pathOf(work.localPath)), WritingOptions::forReplacing,
        [&](const Url&) { context_.queue.sync([&] { replacing = replaceNow(work, staged); }); });
    if (refused)
        discard(staged);
    return refused ? refused : replacing;
}

/// On the store's queue, as are the next two.
Failure SyncExecutor::replaceNow(const Work& work, const Staged& staged) {
    const std::string path = context_.pathOf(work.localPath);
    const std::string stagedPath = context_.layout.staging() + '/' + staged.name;
    if (context_.database.localPathOf(work.step.item) != work.localPath ||
        !isAsRecorded(work, path)) {
        discard(staged);
        return makeError(ErrorCode::changedWhileRead, nameOf(path));
    }
    OpRow op{0,
             work.step.item,
             replacementKind,
             "",
             staged.name,
             staged.version.etag,
             staged.hash,
             0,
             0,
             {},
             {}};
    if (Failure failure = context_.database.transaction([&]() -> Failure {
            op.id = context_.database.putOperation(op);
            return std::nullopt;
        })) {
        discard(staged);
        return failure;
    }
    Failure failure = exchangeStaged(work, stagedPath);
    const Result<FileAttributes> now = context_.disk.attributes(path);
    if (!failure && !now)
        failure = now.error();
    if (!failure)
        failure = context_.disk.syncFolder(std::string(folderOf(path)));
    if (failure) {
        resumeReplacement(context_, op);
        if (context_.disk.attributes(stagedPath))
            discard(staged);
        return failure;
    }
    const Place place = work.state.remote->place;
    return context_.database.transaction([&]() -> Failure {
        context_.database.putRemote(work.step.item, rowOf(place, staged.version, work.state));
        context_.database.putLocal(work.step.item,
                                   localRowOf(work.state.local->place, *now, false));
        context_.database.putBase(
            work.step.item, baseRowOf(place, staged.version.etag, now->size, staged.hash, *now));
        context_.database.removeOperation(op.id);
        return std::nullopt;
    });
}

Failure SyncExecutor::exchangeStaged(const Work& work, const std::string& stagedPath) {
    const std::string path = context_.pathOf(work.localPath);
    const bool unsent = isChangedHere(work.state);
    KeptFolder kept(context_);
    Failure failure = context_.disk.exchange(stagedPath, path);
    if (failure && failure->is(ErrorCode::unsupportedOperation)) {
        const Result<std::string> taken = kept.take(work.localPath, unsent);
        return taken ? context_.disk.rename(stagedPath, path) : Failure(taken.error());
    }
    if (failure)
        return failure;
    const Result<FileAttributes> old = context_.disk.attributes(stagedPath);
    const LocalRow& row = *work.state.local;
    if (!old || old->identity != row.identity || old->size != row.size ||
        old->modified != row.modified) {
        // Somebody saved in the last moment: that is an edit, and stands where it stood.
        const Failure back = context_.disk.exchange(stagedPath, path);
        return back ? back : makeError(ErrorCode::changedWhileRead, nameOf(path));
    }
    const Result<std::string> taken = kept.takeFrom(stagedPath, work.localPath, unsent);
    return taken ? Failure() : Failure(taken.error());
}

/// The remote keeps the name; ours gets one that tells of the conflict, and goes up under it.
Failure SyncExecutor::keepBoth(const Work& work, const Staged& staged) {
    OpRow op{0, work.step.item, conflictKind, "", "", "", {}, 0, 0, {}, {}};
    std::string aside;
    Failure failure = moveAside(work, aside, [&](const std::string& name) {
        Failure noting;
        context_.queue.sync([&] {
            op.staged = name;
            noting = context_.database.transaction([&]() -> Failure {
                op.id = context_.database.putOperation(op);
                return std::nullopt;
            });
        });
        return noting;
    });
    context_.queue.sync([&] {
        if (op.id != 0)
            resumeConflict(context_, op);
        if (!failure)
            failure = placeNow(work, staged, work.localPath);
    });
    if (failure)
        discard(staged);
    else
        platformLog(LogLevel::info, "cloud: “%@” was changed on both sides; yours is “%@”",
                    work.localPath, aside);
    return failure;
}

bool isConflict(const OpRow& op) {
    return op.kind == conflictKind;
}

void resumeConflict(StoreContext& context, const OpRow& op) {
    StateDatabase& database = context.database;
    const std::optional<ItemState> state = database.state(op.item);
    const std::optional<std::string> path = database.localPathOf(op.item);
    std::optional<FileAttributes> moved;
    if (state && state->local && path) {
        const std::string folder(path->find('/') == std::string::npos ? "" : folderOf(*path));
        const Result<FileAttributes> there = context.disk.attributes(
            context.pathOf(folder.empty() ? op.staged : folder + '/' + op.staged));
        if (there && there->identity == state->local->identity)
            moved = *there;
        // That it is not under its old name any more must not be forgotten by the disk alone.
        if (moved && context.disk.syncFolder(context.pathOf(folder)))
            return; // the next start tries again
    }
    const Failure failure = database.transaction([&]() -> Failure {
        database.removeOperation(op.id);
        if (!moved)
            return std::nullopt;
        // What was moved is an item of its own from now on. Of the other nothing is here: that must
        // not look like a deletion by the user.
        database.removeBase(op.item);
        const Place place{state->local->place.parent, op.staged};
        database.removeLocal(op.item);
        database.setItemPlace(op.item, std::nullopt);
        const ItemId ours = database.newItemId();
        database.insertItem({ours, ItemKind::file, place});
        database.putLocal(ours, localRowOf(place, *moved, false));
        return std::nullopt;
    });
    if (failure)
        platformLog(LogLevel::warning, "cloud: cannot tell two contents apart: %@", *failure);
}

Failure SyncExecutor::placeNow(const Work& work, const Staged& staged, const std::string& path) {
    const std::string full = context_.pathOf(path);
    if (Failure failure = context_.disk.rename(context_.layout.staging() + '/' + staged.name, full))
        return failure;
    if (Failure failure = context_.disk.syncFolder(std::string(folderOf(full))))
        return failure;
    const Result<FileAttributes> now = context_.disk.attributes(full);
    if (!now)
        return now.error();
    const Place place = work.state.remote->place;
    return context_.database.transaction([&]() -> Failure {
        context_.database.putRemote(work.step.item, rowOf(place, staged.version, work.state));
        context_.database.setItemPlace(work.step.item, work.state.local->place);
        context_.database.putLocal(work.step.item,
                                   localRowOf(work.state.local->place, *now, false));
        context_.database.putBase(
            work.step.item, baseRowOf(place, staged.version.etag, now->size, staged.hash, *now));
        return std::nullopt;
    });
}

} // namespace platform
