#pragma once

#include "platform/base/NotificationCenter.h"
#include "platform/base/TimerSource.h"
#include "platform/base/WorkQueue.h"

#include <atomic>
#include <cstdint>
#include <memory>

namespace tavrin {

class QuotaFetcher;

class QuotaFetcherDelegate {
public:
    virtual ~QuotaFetcherDelegate() = default;
    /// On the main thread.
    virtual void quotaFetcherDidUpdateValue(QuotaFetcher& /*fetcher*/,
                                            std::uint64_t /*freeBytes*/) {}
};

/// Polls the free bytes of the account while the application is active and online, and hands each
/// new value to its delegate on the main thread. While it may not fetch the ticks go on and do
/// nothing; becoming active does not poll, the next tick does. Made and released on the main
/// thread.
class QuotaFetcher : public std::enable_shared_from_this<QuotaFetcher> {
public:
    static std::shared_ptr<QuotaFetcher> create();
    ~QuotaFetcher();
    QuotaFetcher(const QuotaFetcher&) = delete;
    QuotaFetcher& operator=(const QuotaFetcher&) = delete;

    /// (Re)starts polling: at once, then every `seconds`.
    void runWithInterval(double seconds);

    std::weak_ptr<QuotaFetcherDelegate> delegate() const { return delegate_; }
    void setDelegate(std::weak_ptr<QuotaFetcherDelegate> delegate) {
        delegate_ = std::move(delegate);
    }
    /// The last value received; 0 before the first.
    std::uint64_t freeBytes() const { return freeBytes_; }
    const std::shared_ptr<platform::WorkQueue>& queue() const { return queue_; }
    bool canFetch() const { return canFetch_; }

private:
    QuotaFetcher();
    void performFetch();
    void notify(std::uint64_t freeBytes);
    void didBecomeActiveNotification(const platform::Notification& notification);
    void willResignActiveNotification(const platform::Notification& notification);

    std::weak_ptr<QuotaFetcherDelegate> delegate_;
    std::uint64_t freeBytes_ = 0;
    std::shared_ptr<platform::WorkQueue> queue_;
    std::unique_ptr<platform::TimerSource> timer_;
    std::atomic<bool> canFetch_{true};
    platform::Observation becameActive_;
    platform::Observation willResign_;
};

} // namespace tavrin
