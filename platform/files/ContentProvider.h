#pragma once

#include "platform/base/Result.h"

#include <atomic>
#include <functional>
#include <memory>
#include <mutex>

namespace platform {

/// Tells a blocking operation to stop: set once, from any thread.
class CancelFlag {
public:
    void cancel();
    bool isCancelled() const { return cancelled_.load(std::memory_order_acquire); }
    /// Runs `handler` once when cancelled (at once when that has happened), on the cancelling
    /// thread. Replaces the earlier handler; an empty one takes it away. Waits for one that runs on
    /// another thread, so a handler must not wait for a thread that is in here.
    void setHandler(std::function<void()> handler);

private:
    std::atomic<bool> cancelled_{false};
    std::recursive_mutex mutex_;
    std::function<void()> handler_; // guarded by mutex_
};

/// Who can fetch the contents of a promised document: implemented by the cloud service, asked by
/// the file coordinator.
class ContentProvider {
public:
    virtual ~ContentProvider() = default;

    /// Whether `item` is a document whose contents are only promised.
    virtual bool isPromised(const Url& item) const = 0;
    /// Makes the contents local: blocks until they are, publishing progress for `item`. None on
    /// success. After a cancellation (userCancelled) or a failure the promise stands as before and
    /// no partial file is left. Not on the main thread.
    virtual Failure makeLocal(const Url& item, CancelFlag& cancel) = 0;
    /// The move that works for promised and for local documents alike. Never replaces.
    virtual Failure moveItem(const Url& from, const Url& to) = 0;
};

} // namespace platform
