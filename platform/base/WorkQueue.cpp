#include "platform/base/WorkQueue.h"

#include "platform/base/RunAndWait.h"

#include <condition_variable>
#include <mutex>
#include <pthread.h>
#include <sys/resource.h>
#include <sys/syscall.h>
#include <thread>
#include <unistd.h>
#include <utility>
#include <vector>

namespace platform {
namespace {

thread_local std::string_view currentLabelOfThread;

/// Linux gives each thread its own nice value. Raising one (lowering priority) is always allowed.
int niceValue(WorkPriority priority, int relative) {
    switch (priority) {
    case WorkPriority::background:
        return 15 - relative / 4;
    case WorkPriority::utility:
        return 5 - relative / 3;
    case WorkPriority::standard:
    case WorkPriority::userInitiated:
        return -relative / 5;
    }
    return 0;
}

} // namespace

struct WorkQueue::State {
    std::string label;
    WorkPriority priority = WorkPriority::standard;
    int relative = 0;
    std::mutex mutex;
    std::condition_variable changed;
    std::vector<Job> waiting;
    bool started = false;
    bool sleeping = false;
    bool closing = false;
    std::thread thread;

    static void run(const std::shared_ptr<State>& self) {
        currentLabelOfThread = self->label;
        const std::string shortName = self->label.substr(self->label.rfind('.') + 1).substr(0, 15);
        pthread_setname_np(pthread_self(), shortName.c_str());
        setThreadPriority(self->priority, self->relative);
        std::vector<Job> batch;
        std::unique_lock lock(self->mutex);
        for (;;) {
            if (self->waiting.empty()) {
                if (self->closing)
                    return;
                self->sleeping = true;
                self->changed.wait(lock);
                continue;
            }
            batch.swap(self->waiting);
            lock.unlock();
            for (Job& job : batch) {
                job();
                job = nullptr; // release what it holds before the next one runs
            }
            batch.clear();
            lock.lock();
        }
    }
};

WorkQueue::WorkQueue(std::string label, WorkPriority priority, int relative)
    : state_(std::make_shared<State>()) {
    state_->label = std::move(label);
    state_->priority = priority;
    state_->relative = relative;
}

WorkQueue::~WorkQueue() {
    std::thread thread;
    {
        const std::lock_guard lock(state_->mutex);
        state_->closing = true;
        thread = std::move(state_->thread);
    }
    state_->changed.notify_all();
    if (!thread.joinable())
        return;
    if (thread.get_id() == std::this_thread::get_id())
        thread.detach();
    else
        thread.join();
}

void WorkQueue::async(Job job) {
    bool wake = false;
    {
        const std::lock_guard lock(state_->mutex);
        state_->waiting.push_back(std::move(job));
        if (!state_->started) {
            state_->started = true;
            state_->thread = std::thread([state = state_] { State::run(state); });
        }
        wake = std::exchange(state_->sleeping, false);
    }
    if (wake)
        state_->changed.notify_one();
}

void WorkQueue::sync(const Job& job) {
    if (isCurrent()) {
        job();
        return;
    }
    runAndWait(job, [this](Job waited) { async(std::move(waited)); });
}

const std::string& WorkQueue::label() const {
    return state_->label;
}

bool WorkQueue::isCurrent() const {
    const std::lock_guard lock(state_->mutex);
    return state_->thread.get_id() == std::this_thread::get_id();
}

std::string_view WorkQueue::currentLabel() {
    return currentLabelOfThread;
}

void setThreadPriority(WorkPriority priority, int relative) {
    if (const int nice = niceValue(priority, relative); nice != 0)
        setpriority(PRIO_PROCESS, static_cast<id_t>(syscall(SYS_gettid)), nice);
}

void setCurrentQueueLabel(std::string_view label) {
    currentLabelOfThread = label;
}

} // namespace platform
