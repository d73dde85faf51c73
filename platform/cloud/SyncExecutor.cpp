#include "platform/cloud/SyncExecutor.h"

#include "platform/base/Log.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/files/PathText.h"

#include <array>

namespace platform {
namespace {

/// Agreements that one sync of both disks carries.
constexpr std::size_t batchSize = 256;

bool stopsEverything(const Error& error) {
    constexpr std::array codes{ErrorCode::serverNotAvailable, ErrorCode::authenticationFailed,
                               ErrorCode::userCancelled, ErrorCode::databaseUnusable,
                               ErrorCode::readCorrupt};
    return std::any_of(codes.begin(), codes.end(), [&](ErrorCode code) { return error.is(code); });
}

/// What was known of the remote is no longer so.
bool meansOutdated(const Error& error) {
    return error.is(ErrorCode::changedRemotely) || error.is(ErrorCode::fileExists) ||
           error.is(ErrorCode::noSuchItem) || error.is(ErrorCode::folderNotEmpty);
}

bool needsLocal(StepKind kind) {
    return kind != StepKind::forget && kind != StepKind::arrive && kind != StepKind::remove;
}

bool needsRemote(StepKind kind) {
    switch (kind) {
    case StepKind::adopt:
    case StepKind::arrive:
    case StepKind::moveHere:
    case StepKind::moveThere:
    case StepKind::remove:
    case StepKind::uploadChange:
    case StepKind::download:
    case StepKind::reconcile:
        return true;
    default:
        return false;
    }
}

bool contradicts(const ItemState& state, StepKind kind) {
    if ((needsLocal(kind) && !state.local) || (needsRemote(kind) && !state.remote))
        return true;
    if ((kind == StepKind::arrive || kind == StepKind::remove || kind == StepKind::forget) &&
        state.local)
        return true;
    return (kind == StepKind::upload || kind == StepKind::makeFolder || kind == StepKind::keep ||
            kind == StepKind::forget) &&
           state.remote;
}

} // namespace

SyncExecutor::Outcome SyncExecutor::run(const std::vector<SyncStep>& steps) {
    {
        const std::lock_guard lock(mutex_);
        outcome_ = {};
    }
    bool transferring = false;
    for (const SyncStep& step : steps) {
        if (isStopped())
            break;
        if (isContentStep(step.kind)) {
            transferring = true;
            transfers_.async(TransferQueue::Urgency::engine, [this, &step] {
                if (!isStopped())
                    carryOut(step);
            });
            continue;
        }
        if (std::exchange(transferring, false))
            transfers_.waitForEngine();
        carryOut(step);
    }
    if (transferring)
        transfers_.waitForEngine();
    CancelFlag own;
    const Failure failure = flush(own);
    const std::lock_guard lock(mutex_);
    // What turned out not to be ours is no agreement, and is looked at anew: no reason to stop.
    if (failure && !outcome_.stopped && !failure->is(ErrorCode::changedRemotely))
        outcome_.stopped = failure;
    return std::move(outcome_);
}

void SyncExecutor::cancel() {
    const std::lock_guard lock(mutex_);
    cancelled_ = true;
    for (CancelFlag* flag : running_)
        flag->cancel();
}

bool SyncExecutor::isStopped() {
    const std::lock_guard lock(mutex_);
    return cancelled_ || outcome_.stopped;
}

std::optional<SyncExecutor::Work> SyncExecutor::prepare(const SyncStep& step) {
    std::optional<Work> work;
    context_.queue.sync([&] {
        StateDatabase& database = context_.database;
        std::optional<ItemState> state = database.state(step.item);
        if (!state || contradicts(*state, step.kind))
            return;
        work = Work{step, std::move(*state), database.localPathOf(step.item).value_or(""),
                    database.remotePathOf(step.item).value_or("")};
        // "" is the root; nothing is ever done to that one.
        if ((needsLocal(step.kind) && work->localPath.empty()) ||
            (needsRemote(step.kind) && work->remotePath.empty()))
            work.reset();
    });
    return work;
}

void SyncExecutor::carryOut(const SyncStep& step) {
    std::optional<Work> work = prepare(step);
    if (!work)
        return;
    CancelFlag cancel;
    {
        const std::lock_guard lock(mutex_);
        running_.insert(&cancel);
        if (cancelled_)
            cancel.cancel();
    }
    Failure failure = make(*work, cancel);
    bool full = false;
    {
        const std::lock_guard lock(mutex_);
        running_.erase(&cancel);
        full = agreements_.size() >= batchSize;
    }
    if (!failure && full)
        failure = flush(cancel);
    note(*work, failure);
}

Failure SyncExecutor::make(Work& work, CancelFlag& cancel) {
    std::string aside;
    switch (work.step.kind) {
    case StepKind::adopt:
        return adopt(work);
    case StepKind::merge:
        return merge(work);
    case StepKind::forget:
        return forget(work);
    case StepKind::arrive:
        return arrive(work, cancel);
    case StepKind::moveHere:
        return moveHere(work);
    case StepKind::stepAside:
        return moveAside(work, aside, [](const std::string&) { return Failure(); });
    case StepKind::keep:
        return keep(work);
    case StepKind::makeFolder:
        return makeFolder(work, cancel);
    case StepKind::moveThere:
        return moveThere(work, cancel);
    case StepKind::remove:
        return removeThere(work, cancel);
    case StepKind::upload:
        return upload(work, cancel);
    case StepKind::uploadChange:
        return uploadChange(work, cancel);
    case StepKind::download:
        return download(work, cancel);
    case StepKind::reconcile:
        return reconcile(work, cancel);
    }
    return std::nullopt;
}

/// Where on the disk the step finds something else than the records told.
std::set<std::string> SyncExecutor::foldersOf(const Work& work) {
    std::set<std::string> folders;
    if (!work.localPath.empty()) {
        const std::size_t slash = work.localPath.rfind('/');
        folders.insert(slash == std::string::npos ? "" : work.localPath.substr(0, slash));
        if (work.state.item.kind == ItemKind::folder)
            folders.insert(work.localPath);
    }
    if (work.step.to.parent != 0)
        context_.queue.sync([&] {
            if (const auto to = context_.database.localPathOf(work.step.to.parent))
                folders.insert(*to);
        });
    return folders;
}

void SyncExecutor::note(const Work& work, const Failure& failure) {
    std::set<std::string> disturbed;
    if (failure && (failure->is(ErrorCode::changedWhileRead) || meansOutdated(*failure)))
        disturbed = foldersOf(work);
    const std::lock_guard lock(mutex_);
    if (!failure) {
        outcome_.done += work.leftOut ? 0 : 1;
        return;
    }
    if (stopsEverything(*failure)) {
        if (!outcome_.stopped)
            outcome_.stopped = failure;
        return;
    }
    outcome_.disturbed.merge(disturbed);
    if (meansOutdated(*failure)) {
        if (work.state.remote)
            outcome_.outdated.insert(work.state.remote->place.parent);
        if (work.state.item.kind == ItemKind::folder && work.state.remote)
            outcome_.outdated.insert(work.step.item);
        if (work.step.to.parent != 0)
            outcome_.outdated.insert(work.step.to.parent);
    }
    platformLog(LogLevel::info, "cloud: cannot %@ “%@”: %@", nameOf(work.step.kind),
                work.localPath.empty() ? work.remotePath : work.localPath, *failure);
    outcome_.failed.insert_or_assign(work.step.item, *failure);
}

std::optional<std::string> SyncExecutor::remotePlace(const Place& place) {
    std::optional<std::string> folder;
    context_.queue.sync([&] {
        folder =
            place.parent == rootItem ? std::string() : context_.database.remotePathOf(place.parent);
    });
    if (!folder)
        return std::nullopt;
    return folder->empty() ? place.name : *folder + '/' + place.name;
}

RemoteRow SyncExecutor::rowOf(const Place& place, const RemoteEntry& entry,
                              const ItemState& before) const {
    return {place,          entry.etag,    entry.size,
            entry.modified, entry.created, entry.remoteId,
            entry.role,     entry.tags,    before.remote ? before.remote->generation : 1};
}

void SyncExecutor::agreeLater(ItemId item, BaseRow base, std::optional<RemoteRow> remote) {
    const std::lock_guard lock(mutex_);
    agreements_.push_back({item, std::move(base), std::move(remote)});
}

Failure SyncExecutor::flush(CancelFlag& cancel) {
    std::vector<Agreement> agreements;
    {
        const std::lock_guard lock(mutex_);
        agreements.swap(agreements_);
    }
    if (agreements.empty())
        return std::nullopt;
    if (Failure failure = context_.remote.sync(cancel))
        return failure;
    if (Failure failure = context_.disk.syncAll(context_.layout.root()))
        return failure;
    Failure failure;
    context_.queue.sync([&] {
        failure = context_.database.transaction([&]() -> Failure {
            for (const auto& [item, base, remote] : agreements)
                if (context_.database.state(item)) {
                    if (remote)
                        context_.database.putRemote(item, *remote);
                    context_.database.putBase(item, base);
                }
            return std::nullopt;
        });
    });
    return failure;
}

/// A folder or a promise is on the disk, and not in the records alone.
bool SyncExecutor::standsHere(const Work& work) {
    const std::string path = context_.pathOf(work.localPath);
    if (work.state.local->promise) {
        const auto sidecar = findSidecar(std::string(folderOf(path)), nameOf(path), context_.mark);
        return sidecar && sidecar->mark.item == work.step.item;
    }
    const Result<FileAttributes> now = context_.disk.attributes(path);
    return now && now->identity == work.state.local->identity;
}

Failure SyncExecutor::adopt(const Work& work) {
    const ItemState& state = work.state;
    // What the user has deleted meanwhile was never this version.
    if (!standsHere(work))
        return makeError(ErrorCode::changedWhileRead, nameOf(work.localPath));
    BaseRow base;
    if (state.base)
        base = *state.base;
    base.place = state.remote->place;
    if (state.item.kind == ItemKind::folder || state.local->promise) {
        base.etag = state.remote->etag;
        base.size = state.remote->size;
        base.hash.clear();
        base.identity = state.local->identity;
        base.modified = state.local->modified;
        base.changed = state.local->changed;
    }
    agreeLater(state.item.id, std::move(base));
    return std::nullopt;
}

Failure SyncExecutor::merge(Work& work) {
    Failure failure;
    context_.queue.sync([&] {
        StateDatabase& database = context_.database;
        const std::optional<ItemState> other = database.state(work.step.other);
        if (!other || other->local || !other->remote) {
            failure = leaveOut(work);
            return;
        }
        const LocalRow row = *work.state.local;
        failure = database.transaction([&]() -> Failure {
            database.removeLocal(work.step.item);
            database.setItemPlace(work.step.item, std::nullopt);
            database.moveLocalChildren(work.step.item, work.step.other);
            database.removeItem(work.step.item);
            database.setItemPlace(work.step.other, row.place);
            database.putLocal(work.step.other, row);
            return std::nullopt;
        });
    });
    return failure;
}

Failure SyncExecutor::forget(const Work& work) {
    Failure failure;
    context_.queue.sync([&] {
        failure = context_.database.transaction([&]() -> Failure {
            context_.database.setItemPlace(work.step.item, std::nullopt);
            context_.database.removeItem(work.step.item);
            return std::nullopt;
        });
    });
    return failure;
}

Failure SyncExecutor::refreshBase(const Work& work, const FileAttributes& attributes) {
    Failure failure;
    context_.queue.sync([&] {
        failure = context_.database.transaction([&]() -> Failure {
            BaseRow base = *work.state.base;
            base.identity = attributes.identity;
            base.size = attributes.size;
            base.modified = attributes.modified;
            base.changed = attributes.changed;
            context_.database.putBase(work.step.item, base);
            context_.database.putLocal(work.step.item,
                                       localRowOf(work.state.local->place, attributes, false));
            return std::nullopt;
        });
    });
    return failure;
}

} // namespace platform
