#include "platform/base/AlarmList.h"
#include "platform/base/Clock.h"

#include <condition_variable>
#include <ctime>
#include <mutex>
#include <pthread.h>
#include <sys/time.h>
#include <thread>

namespace platform {
namespace {

class RealClock final : public Clock {
public:
    RealClock() = default;
    RealClock(const RealClock&) = delete;
    RealClock& operator=(const RealClock&) = delete;

    ~RealClock() override {
        {
            const std::lock_guard lock(mutex_);
            stopping_ = true;
        }
        changed_.notify_all();
        if (thread_.joinable())
            thread_.join();
    }

    Date now() const override {
        timespec reading{};
        clock_gettime(CLOCK_REALTIME, &reading);
        return Date::fromParts(reading.tv_sec, reading.tv_nsec);
    }

    Duration monotonic() const override {
        return std::chrono::steady_clock::now().time_since_epoch();
    }

    std::optional<PreciseTime> preciseTime() const override {
        timeval reading{};
        if (gettimeofday(&reading, nullptr) != 0)
            return std::nullopt;
        return PreciseTime{reading.tv_sec, static_cast<std::int32_t>(reading.tv_usec)};
    }

    AlarmId setAlarm(Duration delay, Job job) override {
        const std::lock_guard lock(mutex_);
        const AlarmId id = alarms_.add(monotonic() + delay, std::move(job));
        if (!thread_.joinable())
            thread_ = std::thread([this] { run(); });
        changed_.notify_all();
        return id;
    }

    void cancelAlarm(AlarmId id) override {
        const std::lock_guard lock(mutex_);
        alarms_.cancel(id);
    }

private:
    void run() {
        pthread_setname_np(pthread_self(), "alarms");
        std::unique_lock lock(mutex_);
        while (!stopping_) {
            if (Job job = alarms_.takeDue(monotonic())) {
                lock.unlock();
                job();
                job = nullptr; // what it captured may lock this clock again
                lock.lock();
                continue;
            }
            const std::optional<Duration> due = alarms_.nextDue();
            if (!due)
                changed_.wait(lock);
            else
                changed_.wait_until(lock, std::chrono::steady_clock::time_point(*due));
        }
    }

    std::mutex mutex_;
    std::condition_variable changed_;
    AlarmList alarms_;
    bool stopping_ = false;
    std::thread thread_;
};

} // namespace

std::unique_ptr<Clock> makeRealClock() {
    return std::make_unique<RealClock>();
}

} // namespace platform
