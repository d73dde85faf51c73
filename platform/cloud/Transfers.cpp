#include "platform/cloud/Transfers.h"

#include "platform/base/Log.h"
#include "platform/cloud/ContentHash.h"
#include "platform/cloud/ContentPlacing.h"
#include "platform/cloud/Eviction.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/cloud/SyncExecutor.h"
#include "platform/cloud/Tokens.h"
#include "platform/cloud/TransferActivity.h"
#include "platform/files/PathText.h"
#include "platform/files/Progress.h"

#include <algorithm>
#include <set>

namespace platform {
namespace {

/// How often a content that changes while it is read is begun anew.
constexpr int fetchAttempts = 3;

} // namespace

struct Transfers::Transfer {
    ItemId item = 0;
    Url url;
    /// Relative to the store's root.
    std::string path;
    std::shared_ptr<Progress> progress;
    /// As a listing told of it.
    std::optional<RemoteRow> expected;
    TransferActivity::Entry* shown = nullptr; // while it runs; its thread's
    CancelFlag cancel;
    int waiting = 0; // guarded by the transfers' mutex, as are the two below
    bool done = false;
    Failure result;
};

Transfers::Transfers(StoreContext& context, FileProgressSubscription& progress,
                     std::uint64_t bytesPerSecond, Placed placed)
    : context_(context),
      progress_(progress),
      limiter_(context.clock, bytesPerSecond),
      placed_(std::move(placed)) {
}

Transfers::~Transfers() {
    stop();
}

void Transfers::stop() {
    std::vector<std::shared_ptr<Transfer>> running;
    {
        const std::lock_guard lock(mutex_);
        stopping_ = true;
        for (const auto& [item, transfer] : running_)
            running.push_back(transfer);
        changed_.notify_all();
    }
    for (const auto& transfer : running)
        transfer->cancel.cancel();
    pool_.waitUntilIdle();
    std::unique_lock lock(mutex_);
    changed_.wait(lock, [&] { return callers_ == 0; });
}

Failure Transfers::fetch(const Url& url, CancelFlag& cancel) {
    const std::optional<FoundSidecar> promise =
        findSidecar(std::string(folderOf(url.path())), nameOf(url.path()), context_.mark);
    if (FileManager::exists(url.path()))
        return std::nullopt;
    if (!promise)
        return makeError(ErrorCode::noSuchItem, url.lastPathComponent());
    {
        const std::lock_guard lock(mutex_);
        ++callers_;
    }
    cancel.setHandler([this] {
        const std::lock_guard lock(mutex_);
        changed_.notify_all();
    });
    const std::shared_ptr<Transfer> transfer = join(promise->mark.item, url);
    Failure result =
        transfer ? wait(*transfer, cancel) : Failure(makeError(ErrorCode::userCancelled));
    cancel.setHandler({});
    const std::lock_guard lock(mutex_);
    --callers_;
    changed_.notify_all();
    return result;
}

Failure Transfers::wait(Transfer& transfer, CancelFlag& cancel) {
    std::unique_lock lock(mutex_);
    changed_.wait(lock, [&] { return transfer.done || cancel.isCancelled(); });
    if (!transfer.done && transfer.waiting == 1) {
        lock.unlock(); // the flag's handler takes the mutex
        transfer.cancel.cancel();
        lock.lock();
        // The last one stays until nothing half-done is left.
        changed_.wait(lock, [&] { return transfer.done; });
    }
    --transfer.waiting;
    return transfer.done ? transfer.result : Failure(makeError(ErrorCode::userCancelled));
}

std::shared_ptr<Transfers::Transfer> Transfers::join(ItemId item, const Url& url) {
    std::unique_lock lock(mutex_);
    // One that is being cancelled is no longer to be joined.
    changed_.wait(lock, [&] {
        const auto found = running_.find(item);
        return stopping_ || found == running_.end() || !found->second->cancel.isCancelled();
    });
    if (stopping_)
        return nullptr;
    std::shared_ptr<Transfer>& transfer = running_[item];
    if (!transfer) {
        transfer = std::make_shared<Transfer>();
        transfer->item = item;
        transfer->url = url;
        transfer->path = url.path().substr(context_.layout.root().size() + 1);
        transfer->progress = std::make_shared<Progress>(std::string(fileProgressKind));
        pool_.async(TransferQueue::Urgency::user, [this, transfer] {
            Failure result = run(*transfer);
            const std::lock_guard inner(mutex_);
            transfer->result = std::move(result);
            transfer->done = true;
            running_.erase(transfer->item);
            changed_.notify_all();
        });
    }
    ++transfer->waiting;
    return transfer;
}

Failure Transfers::run(Transfer& transfer) {
    std::optional<ItemState> state;
    std::optional<std::string> remotePath;
    context_.queue.sync([&] {
        state = context_.database.state(transfer.item);
        remotePath = context_.database.remotePathOf(transfer.item);
    });
    if (!state || !state->remote || !remotePath)
        return makeError(ErrorCode::noSuchItem, transfer.url.lastPathComponent());
    const std::uint64_t size = state->remote->size;
    transfer.expected = state->remote;
    transfer.progress->update(0, static_cast<std::int64_t>(size));
    const auto published = progress_.publish(transfer.url, transfer.progress);
    TransferActivity::Entry shown(context_.activity, transfer.path, false, size);
    transfer.shown = &shown;
    Failure failure;
    for (int i = 0; i < fetchAttempts; ++i) {
        failure = attempt(transfer, *remotePath, size);
        if (!failure || !failure->is(ErrorCode::changedWhileRead))
            break;
    }
    if (failure && !failure->is(ErrorCode::userCancelled))
        platformLog(LogLevel::warning, "cloud: cannot download “%@”: %@", *remotePath, *failure);
    return failure ? namedForPeople(*failure, transfer.url.lastPathComponent()) : failure;
}

Failure Transfers::attempt(Transfer& transfer, const std::string& remotePath, std::uint64_t size) {
    const std::string name =
        hexText(static_cast<std::uint64_t>(transfer.item)) + '-' + hexText(randomBytes(6));
    const std::string staged = context_.layout.staging() + '/' + name;
    Bytes hash;
    const Result<RemoteEntry> version = stage(transfer, remotePath, size, staged, hash);
    Failure failure;
    if (!version) {
        failure = version.error();
    } else {
        context_.queue.sync([&] {
            failure = transfer.cancel.isCancelled()
                          ? Failure(makeError(ErrorCode::userCancelled))
                          : ContentPlacing(context_).place(transfer.item, transfer.path, name,
                                                           *version, hash);
            if (!failure && placed_)
                placed_(transfer.item);
        });
    }
    // Only the staged file is ours to remove; once it has its name it is not here any more.
    if (failure)
        if (const Failure left = context_.disk.removeFile(staged))
            platformLog(LogLevel::warning, "cloud: cannot remove %@: %@", staged, *left);
    return failure;
}

Result<RemoteEntry> Transfers::stage(Transfer& transfer, const std::string& remotePath,
                                     std::uint64_t size, const std::string& staged, Bytes& hash) {
    Result<std::unique_ptr<StagedFile>> file = context_.disk.stage(staged, size);
    if (!file)
        return file.error();
    ContentHash content;
    std::uint64_t received = 0;
    const std::size_t portion = limiter_.largestPortion();
    const auto sink = [&](std::span<const std::byte> piece) -> Failure {
        while (!piece.empty()) {
            const std::span<const std::byte> part = piece.first(std::min(portion, piece.size()));
            if (!limiter_.take(part.size(), transfer.cancel))
                return makeError(ErrorCode::userCancelled);
            if (Failure failure = (*file)->write(part))
                return failure;
            content.add(part);
            received += part.size();
            transfer.shown->setDone(received);
            transfer.progress->update(static_cast<std::int64_t>(received),
                                      static_cast<std::int64_t>(std::max(size, received)));
            piece = piece.subspan(part.size());
        }
        return std::nullopt;
    };
    Result<RemoteEntry> version = context_.remote.read(remotePath, sink, transfer.cancel);
    if (!version)
        return version;
    if (received != version->size || isCutShort(*version, *transfer.expected))
        return makeError(ErrorCode::changedWhileRead, version->name);
    if (Failure failure = (*file)->finish(version->modified, version->tags))
        return *failure;
    if (Failure failure = (*file)->sync())
        return *failure;
    hash = content.finish();
    return version;
}

void Transfers::recover(StoreContext& context) {
    ContentPlacing placing(context);
    for (const OpRow& op : context.database.operations())
        if (Eviction::owns(op))
            Eviction::resume(context, op);
        else if (isReplacement(op))
            resumeReplacement(context, op);
        else if (isConflict(op))
            resumeConflict(context, op);
        else
            placing.resume(op);
    const Result<std::vector<DirectoryEntry>> left = context.disk.entries(context.layout.staging());
    if (!left)
        return;
    // What could not be finished may be the only place of its content: the next start tries again.
    std::set<std::string> needed;
    for (const OpRow& op : context.database.operations())
        needed.insert(op.staged);
    if (context.database.takeFault())
        return;
    for (const DirectoryEntry& entry : *left)
        if (needed.contains(entry.name))
            continue;
        else if (const Failure failure =
                     context.disk.removeFile(context.layout.staging() + '/' + entry.name))
            platformLog(LogLevel::warning, "cloud: cannot remove %@: %@", entry.name, *failure);
}

} // namespace platform
