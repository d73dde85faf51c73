#pragma once

#include "platform/base/OperationQueue.h"

#include <condition_variable>
#include <deque>
#include <mutex>

namespace platform {

/// All transfers of a store, up to eight at once: what the user waits for goes before what the
/// engine does on its own, each kind in the order in which it came. Safe from any thread.
class TransferQueue {
public:
    enum class Urgency { user, engine };

    TransferQueue() : pool_("transfers", transfersAtOnce) {}
    ~TransferQueue() { pool_.waitUntilIdle(); }
    TransferQueue(const TransferQueue&) = delete;
    TransferQueue& operator=(const TransferQueue&) = delete;

    void async(Urgency urgency, Job job) {
        {
            const std::lock_guard lock(mutex_);
            if (urgency == Urgency::user) {
                urgent_.push_back(std::move(job));
            } else {
                ++engineJobs_;
                others_.push_back([this, job = std::move(job)] {
                    job();
                    const std::lock_guard ended(mutex_);
                    --engineJobs_;
                    ended_.notify_all();
                });
            }
        }
        pool_.async([this] { next()(); });
    }
    void waitUntilIdle() { pool_.waitUntilIdle(); }
    /// Until nothing of the engine's own waits or runs.
    void waitForEngine() {
        std::unique_lock lock(mutex_);
        ended_.wait(lock, [this] { return engineJobs_ == 0; });
    }

private:
    static constexpr unsigned transfersAtOnce = 8;

    Job next() {
        const std::lock_guard lock(mutex_);
        std::deque<Job>& queue = urgent_.empty() ? others_ : urgent_;
        Job job = std::move(queue.front());
        queue.pop_front();
        return job;
    }

    std::mutex mutex_;
    std::deque<Job> urgent_; // guarded by mutex_, as is the next
    std::deque<Job> others_;
    std::size_t engineJobs_ = 0;
    std::condition_variable ended_;
    OperationQueue pool_;
};

} // namespace platform
