#pragma once

#include "platform/cloud/RateLimiter.h"
#include "platform/cloud/Remote.h"
#include "platform/cloud/StoreContext.h"
#include "platform/cloud/TransferQueue.h"

#include <condition_variable>
#include <functional>
#include <map>
#include <memory>
#include <mutex>

namespace platform {

class FileProgressSubscription;
class Progress;

/// Fetches the contents of promises, up to eight at once. A content is staged, proved to be one
/// whole version of the remote's, brought to the disk, given its name, written down, and only then
/// is the sidecar removed: a stop between any two of these leaves the promise or the file.
class Transfers {
public:
    /// `placed` is called on the store's queue when an item's content is at its place.
    using Placed = std::function<void(ItemId item)>;
    Transfers(StoreContext& context, FileProgressSubscription& progress,
              std::uint64_t bytesPerSecond, Placed placed);
    ~Transfers();
    Transfers(const Transfers&) = delete;
    Transfers& operator=(const Transfers&) = delete;

    /// Blocks until the document at `url` is local. Callers for one item share its transfer; it
    /// ends when the last of them is cancelled. Not on the store's queue.
    [[nodiscard]] Failure fetch(const Url& url, CancelFlag& cancel);

    /// Cancels what runs and waits for it; what comes later is cancelled at once. Not on the
    /// store's queue.
    void stop();

    /// What the engine transfers on its own shares both.
    TransferQueue& queue() { return pool_; }
    RateLimiter& limiter() { return limiter_; }

    /// Finishes or undoes what a stopped program left. On the store's queue.
    static void recover(StoreContext& context);

private:
    struct Transfer;
    Failure wait(Transfer& transfer, CancelFlag& cancel);
    std::shared_ptr<Transfer> join(ItemId item, const Url& url);
    Failure run(Transfer& transfer);
    Failure attempt(Transfer& transfer, const std::string& remotePath, std::uint64_t size);
    Result<RemoteEntry> stage(Transfer& transfer, const std::string& remotePath, std::uint64_t size,
                              const std::string& staged, Bytes& hash);

    StoreContext& context_;
    FileProgressSubscription& progress_;
    RateLimiter limiter_;
    Placed placed_;
    std::mutex mutex_;
    std::condition_variable changed_;
    std::map<ItemId, std::shared_ptr<Transfer>> running_; // guarded by mutex_
    int callers_ = 0;                                     // guarded by mutex_
    bool stopping_ = false;                               // guarded by mutex_
    TransferQueue pool_;
};

} // namespace platform
