#include "platform/cloud/ContentHash.h"
#include "platform/cloud/RateLimiter.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/cloud/SyncExecutor.h"
#include "platform/cloud/SyncTimes.h"
#include "platform/cloud/TransferActivity.h"
#include "platform/files/PathText.h"

namespace platform {

Failure SyncExecutor::makeFolder(Work& work, CancelFlag& cancel) {
    const std::optional<std::string> path = remotePlace(work.state.local->place);
    if (!path)
        return leaveOut(work); // the folder above comes first
    const Result<RemoteEntry> made = context_.remote.makeFolder(*path, cancel);
    if (!made)
        return made.error();
    const Place place = work.state.local->place;
    Failure failure;
    context_.queue.sync([&] {
        failure = context_.database.transaction([&]() -> Failure {
            context_.database.putRemote(work.step.item, rowOf(place, *made, work.state));
            context_.database.putScan(work.step.item, Side::remote, {1, true});
            return std::nullopt;
        });
    });
    if (!failure) {
        const LocalRow& local = *work.state.local;
        agreeLater(work.step.item,
                   {place, made->etag, 0, {}, local.identity, local.modified, local.changed});
    }
    return failure;
}

Failure SyncExecutor::moveThere(Work& work, CancelFlag& cancel) {
    const std::optional<std::string> to = remotePlace(work.step.to);
    if (!to)
        return leaveOut(work);
    const bool folder = work.state.item.kind == ItemKind::folder;
    const Result<RemoteEntry> moved = context_.remote.move(
        work.remotePath, *to, folder ? std::string() : work.state.remote->etag, cancel);
    if (!moved)
        return moved.error();
    Failure failure;
    context_.queue.sync([&] {
        failure = context_.database.transaction([&]() -> Failure {
            context_.database.putRemote(work.step.item, rowOf(work.step.to, *moved, work.state));
            return std::nullopt;
        });
    });
    if (failure || !work.state.base)
        return failure;
    BaseRow base = *work.state.base;
    base.place = work.step.to;
    if (base.etag == work.state.remote->etag) // the version that was moved is the one agreed on
        base.etag = moved->etag;
    agreeLater(work.step.item, std::move(base));
    return std::nullopt;
}

Failure SyncExecutor::removeThere(const Work& work, CancelFlag& cancel) {
    const bool folder = work.state.item.kind == ItemKind::folder;
    Failure failure =
        context_.remote.remove(work.remotePath, work.state.item.kind,
                               folder ? std::string() : work.state.remote->etag, cancel);
    // A folder that is not there may have been moved with all that is in it: a listing tells.
    if (failure && (folder || !failure->is(ErrorCode::noSuchItem)))
        return failure;
    context_.queue.sync([&] {
        StateDatabase& database = context_.database;
        failure = database.transaction([&]() -> Failure {
            // A folder that could be removed had nothing in it any more.
            for (const ItemId item : database.treeOf(work.step.item, Side::remote))
                if (item != work.step.item)
                    database.displaceRemote(item, work.state.remote->place.parent);
            database.removeRemote(work.step.item);
            return std::nullopt;
        });
    });
    return failure;
}

Failure SyncExecutor::upload(Work& work, CancelFlag& cancel) {
    if (work.state.base && !work.state.base->hash.empty()) {
        // Deleted there: only a real edit is a reason to bring it back.
        const Result<LocalContent> content =
            readLocalContent(context_.disk, context_.pathOf(work.localPath), cancel);
        if (!content)
            return content.error();
        if (content->hash == work.state.base->hash)
            return refreshBase(work, content->attributes);
    }
    const Place place = work.state.local->place;
    const std::optional<std::string> path = remotePlace(place);
    return path ? send(work, *path, place, RemoteCondition::nameFree(), cancel) : leaveOut(work);
}

Failure SyncExecutor::uploadChange(Work& work, CancelFlag& cancel) {
    const LocalRow& local = *work.state.local;
    const BaseRow& base = *work.state.base;
    if (local.size == base.size && local.modified == base.modified) {
        // A rename, other rights or a tag look like this as well.
        const Result<LocalContent> content =
            readLocalContent(context_.disk, context_.pathOf(work.localPath), cancel);
        if (!content)
            return content.error();
        if (content->hash == base.hash)
            return refreshBase(work, content->attributes);
    }
    return send(work, work.remotePath, work.state.remote->place,
                RemoteCondition::version(work.state.remote->etag), cancel);
}

Failure SyncExecutor::send(Work& work, const std::string& path, const Place& place,
                           const RemoteCondition& condition, CancelFlag& cancel) {
    const std::string local = context_.pathOf(work.localPath);
    const Error changed = makeError(ErrorCode::changedWhileRead, nameOf(local));
    const Result<std::unique_ptr<OpenContent>> file = context_.disk.openContent(local);
    if (!file)
        return file.error().is(ErrorCode::noSuchItem) ? changed : file.error();
    const Result<FileAttributes> before = (*file)->attributes();
    if (!before)
        return before.error();
    if (isYoung(before->modified, context_.clock.now())) {
        const std::lock_guard lock(mutex_);
        outcome_.settlesIn = settleTimeOf(before->modified);
        outcome_.youngFile = work.localPath;
        return leaveOut(work);
    }
    if (!sameContentAs(*before, FileAttributes{FileKind::file,
                                               work.state.local->size,
                                               {},
                                               work.state.local->modified,
                                               {},
                                               work.state.local->identity,
                                               1,
                                               0}))
        return changed;
    ContentHash hash;
    std::uint64_t hashed = 0;
    const auto same = [&] {
        const Result<FileAttributes> now = (*file)->attributes();
        return now && sameContentAs(*now, *before) && now->changed == before->changed;
    };
    TransferActivity::Entry shown(context_.activity, work.localPath, true, before->size);
    RemoteUpload upload{before->size,
                        before->modified,
                        extendedAttribute(local, "user.xdg.tags", FollowLinks::no).value_or(""),
                        {}};
    upload.read = [&](std::uint64_t offset, std::span<std::byte> buffer) -> Result<std::size_t> {
        const std::size_t portion = std::min(buffer.size(), limiter_.largestPortion());
        const Result<std::size_t> got = (*file)->read(offset, buffer.first(portion));
        if (!got)
            return got;
        if (*got == 0)
            return same() ? got : Result<std::size_t>(changed);
        if (!limiter_.take(*got, cancel))
            return makeError(ErrorCode::userCancelled);
        shown.setDone(offset + *got);
        if (offset == hashed) { // a remote that begins anew has it hashed already
            hash.add(buffer.first(*got));
            hashed += *got;
        }
        return got;
    };
    const Result<RemoteEntry> written = context_.remote.write(path, upload, condition, cancel);
    if (!written)
        return written.error();
    if (written->size != before->size || hashed != before->size)
        return makeError(ErrorCode::changedRemotely, nameOf(path));
    // A stop before that is like an answer that was lost: the two contents are found to be equal.
    agreeLater(work.step.item,
               baseRowOf(place, written->etag, written->size, hash.finish(), *before),
               rowOf(place, *written, work.state));
    return std::nullopt;
}

} // namespace platform
