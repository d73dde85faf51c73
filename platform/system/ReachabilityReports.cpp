#include "platform/system/ReachabilityReports.h"

#include <utility>

namespace platform {
namespace {

class Target final : public ReachabilityTarget {
public:
    explicit Target(std::shared_ptr<ReachabilityReports> reports) : reports_(std::move(reports)) {}
    ~Target() override { reports_->detach(); }

    bool setCallback(Callback callback) override {
        reports_->attach(std::move(callback));
        return true;
    }
    bool setQueue(std::shared_ptr<WorkQueue> queue) override {
        reports_->attach(std::move(queue));
        return true;
    }

private:
    std::shared_ptr<ReachabilityReports> reports_;
};

} // namespace

void ReachabilityReports::tell(std::uint32_t flags) {
    const Lock lock(mutex_);
    if (std::exchange(flags_, flags) == flags || !callback_ || !queue_)
        return;
    queue_->async([self = shared_from_this(), attachment = attachment_, flags] {
        self->report(attachment, flags);
    });
}

void ReachabilityReports::attach(ReachabilityTarget::Callback callback) {
    Lock lock(mutex_);
    callback_.swap(callback); // what the former one holds may go its way only without the lock
    changeAttachment(lock);
    lock.unlock();
}

void ReachabilityReports::attach(std::shared_ptr<WorkQueue> queue) {
    Lock lock(mutex_);
    queue_.swap(queue);
    changeAttachment(lock);
    lock.unlock();
}

void ReachabilityReports::detach() {
    attach(ReachabilityTarget::Callback{});
    attach(std::shared_ptr<WorkQueue>{});
}

/// The first report of an attachment tells the state as it is known.
void ReachabilityReports::changeAttachment(Lock& lock) {
    const std::uint64_t mine = ++attachment_;
    if (running_ != std::this_thread::get_id())
        quiet_.wait(lock, [this] { return !running_; });
    if (attachment_ != mine || !callback_ || !queue_ || !flags_)
        return;
    queue_->async(
        [self = shared_from_this(), mine, flags = *flags_] { self->report(mine, flags); });
}

void ReachabilityReports::report(std::uint64_t attachment, std::uint32_t flags) {
    ReachabilityTarget::Callback callback;
    {
        const Lock lock(mutex_);
        if (attachment != attachment_ || !callback_)
            return;
        callback = callback_;
        running_ = std::this_thread::get_id();
    }
    callback(flags);
    callback = nullptr;
    const Lock lock(mutex_);
    running_.reset();
    quiet_.notify_all();
}

std::unique_ptr<ReachabilityTarget> ReachabilityTargets::make(const std::string& host) {
    auto reports = std::make_shared<ReachabilityReports>(host);
    const std::lock_guard lock(mutex_);
    std::erase_if(all_, [](const auto& one) { return one.expired(); });
    all_.push_back(reports);
    return std::make_unique<Target>(std::move(reports));
}

std::vector<std::shared_ptr<ReachabilityReports>> ReachabilityTargets::living() {
    const std::lock_guard lock(mutex_);
    std::vector<std::shared_ptr<ReachabilityReports>> out;
    for (const auto& one : all_)
        if (auto held = one.lock())
            out.push_back(std::move(held));
    return out;
}

} // namespace platform
