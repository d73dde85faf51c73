#include "platform/documents/model/Parallel.h"

#include "platform/base/OperationQueue.h"

#include <algorithm>
#include <atomic>
#include <condition_variable>
#include <memory>
#include <mutex>
#include <thread>

namespace platform {
namespace {

/// A helper thread takes some 50 µs to come.
constexpr std::size_t worthAThread = 2048;
constexpr std::size_t mostPieces = 4;

struct Pieces {
    const std::function<void(std::size_t)>* work;
    std::size_t count;
    std::atomic<std::size_t> next{0};
    std::mutex mutex;
    std::condition_variable changed;
    std::size_t done = 0; // guarded by mutex

    /// Touches `work` only with a piece in hand, for which the caller waits.
    void take() {
        for (std::size_t piece = next++; piece < count; piece = next++) {
            (*work)(piece);
            const std::lock_guard lock(mutex);
            if (++done == count)
                changed.notify_all();
        }
    }
};

} // namespace

std::size_t parallelPieces(std::size_t count) {
    const std::size_t cores = std::max(1U, std::thread::hardware_concurrency());
    return std::clamp<std::size_t>(count / worthAThread, 1, std::min(cores, mostPieces));
}

void inParallel(std::size_t pieces, const std::function<void(std::size_t)>& work) {
    if (pieces <= 1) {
        if (pieces == 1)
            work(0);
        return;
    }
    const auto shared = std::make_shared<Pieces>();
    shared->work = &work;
    shared->count = pieces;
    for (std::size_t i = 1; i < pieces; ++i)
        OperationQueue::global().async([shared] { shared->take(); });
    shared->take();
    std::unique_lock lock(shared->mutex);
    shared->changed.wait(lock, [&] { return shared->done == pieces; });
}

} // namespace platform
