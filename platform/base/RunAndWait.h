#pragma once

#include "platform/base/Clock.h"

#include <condition_variable>
#include <mutex>

namespace platform {

/// Hands `job` to `async`, which runs it on another thread, and waits for its end.
template<class Async>
void runAndWait(const Job& job, Async&& async) {
    std::mutex mutex;
    std::condition_variable done;
    bool finished = false;
    async([&] {
        job();
        const std::lock_guard lock(mutex);
        finished = true;
        done.notify_one();
    });
    std::unique_lock lock(mutex);
    done.wait(lock, [&] { return finished; });
}

} // namespace platform
