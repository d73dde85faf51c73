#pragma once

#include "platform/system/ReachabilityService.h"

#include <chrono>
#include <condition_variable>
#include <mutex>
#include <vector>

namespace test {

inline constexpr std::uint32_t wifi = platform::reachabilityReachable;
inline constexpr std::uint32_t cellular =
    platform::reachabilityReachable | platform::reachabilityCellular;

/// What a target reports, in order.
class NetworkReports {
public:
    using Flags = std::vector<std::uint32_t>;

    explicit NetworkReports(platform::ReachabilityService& service,
                            const std::string& host = "www.example.com")
        : target_(service.createTarget(host)) {
        target_->setCallback([this](std::uint32_t flags) { heard(flags); });
        attachQueue();
    }
    ~NetworkReports() { target_.reset(); }
    NetworkReports(const NetworkReports&) = delete;
    NetworkReports& operator=(const NetworkReports&) = delete;

    void attachQueue() { target_->setQueue(queue_); }
    void detachQueue() { target_->setQueue(nullptr); }
    void detachCallback() { target_->setCallback({}); }
    void finishQueue() {
        queue_->sync([] {});
    }
    void onReport(std::function<void()> job) {
        const std::lock_guard lock(mutex_);
        onReport_ = std::move(job);
    }
    bool waitFor(const Flags& expected) {
        return waitUntil([&] { return flags_ == expected; });
    }
    bool waitForLast(std::uint32_t flags) {
        return waitUntil([&] { return !flags_.empty() && flags_.back() == flags; });
    }
    Flags all() {
        const std::lock_guard lock(mutex_);
        return flags_;
    }

private:
    void heard(std::uint32_t flags) {
        std::function<void()> job;
        {
            const std::lock_guard lock(mutex_);
            flags_.push_back(flags);
            job = onReport_;
        }
        changed_.notify_all();
        if (job)
            job();
    }
    template<class Condition>
    bool waitUntil(const Condition& condition) {
        std::unique_lock lock(mutex_);
        return changed_.wait_for(lock, std::chrono::seconds(20), condition);
    }

    std::mutex mutex_;
    std::condition_variable changed_;
    Flags flags_;
    std::function<void()> onReport_;
    std::shared_ptr<platform::WorkQueue> queue_ =
        std::make_shared<platform::WorkQueue>("test.network");
    std::unique_ptr<platform::ReachabilityTarget> target_;
};

} // namespace test
