#include "platform/base/OperationQueue.h"

#include <chrono>
#include <condition_variable>
#include <deque>
#include <mutex>
#include <thread>

namespace platform {
namespace {

/// A thread without work waits this long for more before it ends.
constexpr auto idleTime = std::chrono::seconds(2);

} // namespace

struct OperationQueue::State {
    std::string name;
    unsigned width = 1;
    WorkPriority priority = WorkPriority::standard;
    std::mutex mutex;
    std::condition_variable changed;
    std::condition_variable idle;
    std::deque<Job> waiting;
    unsigned threads = 0;
    unsigned sleeping = 0;
    unsigned running = 0;
    bool closing = false;

    static void run(const std::shared_ptr<State>& self) {
        setCurrentQueueLabel(self->name);
        setThreadPriority(self->priority);
        std::unique_lock lock(self->mutex);
        for (;;) {
            if (self->waiting.empty()) {
                ++self->sleeping;
                if (!self->closing)
                    self->changed.wait_for(lock, idleTime,
                                           [&] { return self->closing || !self->waiting.empty(); });
                --self->sleeping;
                if (self->waiting.empty())
                    break;
            }
            Job job = std::move(self->waiting.front());
            self->waiting.pop_front();
            ++self->running;
            lock.unlock();
            job();
            job = nullptr;
            lock.lock();
            if (--self->running == 0 && self->waiting.empty())
                self->idle.notify_all();
        }
        --self->threads;
    }
};

OperationQueue::OperationQueue(std::string name, unsigned width, WorkPriority priority)
    : state_(std::make_shared<State>()) {
    state_->name = std::move(name);
    state_->width = width;
    state_->priority = priority;
}

OperationQueue::~OperationQueue() {
    {
        const std::lock_guard lock(state_->mutex);
        state_->closing = true;
    }
    state_->changed.notify_all();
}

void OperationQueue::async(Job job) {
    const std::lock_guard lock(state_->mutex);
    state_->waiting.push_back(std::move(job));
    if (state_->sleeping >= state_->waiting.size()) {
        state_->changed.notify_one();
    } else if (state_->threads < state_->width) {
        ++state_->threads;
        std::thread([state = state_] { State::run(state); }).detach();
    }
}

void OperationQueue::waitUntilIdle() {
    std::unique_lock lock(state_->mutex);
    state_->idle.wait(lock, [this] { return state_->waiting.empty() && state_->running == 0; });
}

OperationQueue& OperationQueue::global() {
    static OperationQueue* const queue = new OperationQueue(); // lives as long as the process
    return *queue;
}

} // namespace platform
