#pragma once

#include "platform/base/Executor.h"

#include <memory>
#include <thread>
#include <utility>

namespace platform {

/// Ends a delayed job when it goes away. Default-made: holds none. Belongs to the main thread.
class Timer {
public:
    Timer() = default;
    Timer(Clock& clock, Clock::AlarmId id, std::shared_ptr<bool> armed)
        : clock_(&clock), id_(id), armed_(std::move(armed)) {}
    ~Timer() { cancel(); }
    Timer(Timer&&) noexcept = default;
    Timer& operator=(Timer&& other) noexcept;
    void cancel();
    /// True until the job has run or was cancelled.
    explicit operator bool() const { return armed_ && *armed_; }

private:
    Clock* clock_ = nullptr;
    Clock::AlarmId id_ = 0;
    std::shared_ptr<bool> armed_;
};

/// The queue of the main thread. The event loop drains it: `setWake` is called, from any thread,
/// when a job arrives in an empty queue and must make the loop call drain() soon.
class MainQueue final : public Executor {
public:
    /// The constructing thread becomes the main thread.
    explicit MainQueue(Clock& clock);
    ~MainQueue() override;
    MainQueue(const MainQueue&) = delete;
    MainQueue& operator=(const MainQueue&) = delete;

    void async(Job job) override;
    /// Runs the job on the main thread after `delay`; the delay cannot be taken back, so the job
    /// captures weakly what may go away.
    void after(Duration delay, Job job);
    /// The same, ended when the answered timer goes away or is cancelled (on the main thread).
    [[nodiscard]] Timer timer(Duration delay, Job job);
    /// Runs what waits, and what that adds, until `limit` has passed (there is always progress).
    /// Answers true when jobs are left.
    bool drain(Duration limit = std::chrono::milliseconds(8));
    /// Runs until nothing waits.
    void drainAll();

    void setWake(Job wake);
    bool isMainThread() const { return std::this_thread::get_id() == thread_; }
    Clock& clock() const { return clock_; }

private:
    struct State;
    Clock& clock_;
    std::thread::id thread_;
    std::shared_ptr<State> state_;
};

} // namespace platform
