#pragma once

#include <atomic>
#include <fstream>
#include <functional>
#include <future>
#include <string>
#include <thread>
#include <unistd.h>

namespace test {

/// Something that happens once and that other threads wait for; fails the wait after a while.
class Event {
public:
    void signal() { promise_.set_value(); }
    bool wait() const {
        return future_.wait_for(std::chrono::seconds(20)) == std::future_status::ready;
    }
    bool happened() const {
        return future_.wait_for(std::chrono::seconds(0)) == std::future_status::ready;
    }

private:
    std::promise<void> promise_;
    std::shared_future<void> future_ = promise_.get_future().share();
};

/// A thread that runs one job and of which one can tell that it waits for something.
class Worker {
public:
    explicit Worker(std::function<void()> job)
        : thread_([this, job = std::move(job)] {
              id_ = ::gettid();
              job();
              done_ = true;
          }) {}
    ~Worker() { join(); }
    Worker(const Worker&) = delete;
    Worker& operator=(const Worker&) = delete;

    void join() {
        if (thread_.joinable())
            thread_.join();
    }
    bool done() const { return done_; }

    /// Returns when the kernel says that the thread sleeps, or when its job has ended.
    void untilBlocked() const {
        while (!done_) {
            std::string state;
            if (id_ != 0)
                std::ifstream("/proc/self/task/" + std::to_string(id_) + "/stat") >> state >>
                    state >> state;
            if (state == "S")
                return;
            std::this_thread::yield();
        }
    }

private:
    std::atomic<int> id_{0};
    std::atomic<bool> done_{false};
    std::thread thread_;
};

} // namespace test
