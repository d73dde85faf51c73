#pragma once

#include "platform/system/ReachabilityService.h"

#include <condition_variable>
#include <mutex>
#include <thread>
#include <vector>

namespace platform {

/// Brings the reports of one target to its callback, on its queue. Safe from any thread.
class ReachabilityReports : public std::enable_shared_from_this<ReachabilityReports> {
public:
    explicit ReachabilityReports(std::string host) : host_(std::move(host)) {}
    const std::string& host() const { return host_; }

    /// The target's state is this; reported when it is news to the callback.
    void tell(std::uint32_t flags);
    void attach(ReachabilityTarget::Callback callback);
    void attach(std::shared_ptr<WorkQueue> queue);
    void detach();

private:
    using Lock = std::unique_lock<std::mutex>;
    void changeAttachment(Lock& lock);
    void report(std::uint64_t attachment, std::uint32_t flags);

    const std::string host_;
    std::mutex mutex_;
    std::condition_variable quiet_;
    ReachabilityTarget::Callback callback_;
    std::shared_ptr<WorkQueue> queue_;
    std::optional<std::uint32_t> flags_;
    /// Reports of an earlier attachment come to nothing.
    std::uint64_t attachment_ = 0;
    std::optional<std::thread::id> running_;
};

/// The targets of a service.
class ReachabilityTargets {
public:
    /// The target holds its reports; whoever serves it hears of it only while it lives.
    std::unique_ptr<ReachabilityTarget> make(const std::string& host);
    std::vector<std::shared_ptr<ReachabilityReports>> living();

private:
    std::mutex mutex_;
    std::vector<std::weak_ptr<ReachabilityReports>> all_;
};

} // namespace platform
