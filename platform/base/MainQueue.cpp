#include "platform/base/MainQueue.h"

#include "platform/base/WorkQueue.h"

#include <deque>
#include <mutex>

namespace platform {

Timer& Timer::operator=(Timer&& other) noexcept {
    if (this != &other) {
        cancel();
        clock_ = other.clock_;
        id_ = other.id_;
        armed_ = std::move(other.armed_);
    }
    return *this;
}

void Timer::cancel() {
    if (!armed_)
        return;
    *armed_ = false;
    armed_.reset();
    clock_->cancelAlarm(id_);
}

struct MainQueue::State {
    std::mutex mutex;
    std::deque<Job> waiting;
    Job wake;

    void add(Job job) {
        Job waker;
        {
            const std::lock_guard lock(mutex);
            waiting.push_back(std::move(job));
            if (waiting.size() == 1)
                waker = wake;
        }
        if (waker)
            waker();
    }

    Job take() {
        const std::lock_guard lock(mutex);
        if (waiting.empty())
            return {};
        Job job = std::move(waiting.front());
        waiting.pop_front();
        return job;
    }
};

MainQueue::MainQueue(Clock& clock)
    : clock_(clock), thread_(std::this_thread::get_id()), state_(std::make_shared<State>()) {
    setCurrentQueueLabel("main");
}

MainQueue::~MainQueue() = default;

void MainQueue::async(Job job) {
    state_->add(std::move(job));
}

void MainQueue::after(Duration delay, Job job) {
    clock_.setAlarm(delay, [state = std::weak_ptr(state_), job = std::move(job)]() mutable {
        if (const auto alive = state.lock())
            alive->add(std::move(job));
    });
}

Timer MainQueue::timer(Duration delay, Job job) {
    // The flag closes the gap between the alarm's hop to this queue and a cancellation: the timer
    // may be cancelled while the job already waits here.
    auto armed = std::make_shared<bool>(true);
    const Clock::AlarmId id = clock_.setAlarm(
        delay, [state = std::weak_ptr(state_), armed, job = std::move(job)]() mutable {
            const auto alive = state.lock();
            if (!alive)
                return;
            alive->add([armed = std::move(armed), job = std::move(job)] {
                if (std::exchange(*armed, false))
                    job();
            });
        });
    return {clock_, id, std::move(armed)};
}

bool MainQueue::drain(Duration limit) {
    const auto end = std::chrono::steady_clock::now() + limit;
    while (Job job = state_->take()) {
        job();
        job = nullptr;
        if (std::chrono::steady_clock::now() >= end)
            break;
    }
    const std::lock_guard lock(state_->mutex);
    return !state_->waiting.empty();
}

void MainQueue::drainAll() {
    while (Job job = state_->take())
        job();
}

void MainQueue::setWake(Job wake) {
    bool pending = false;
    {
        const std::lock_guard lock(state_->mutex);
        state_->wake = wake;
        pending = !state_->waiting.empty();
    }
    if (pending && wake)
        wake();
}

} // namespace platform
