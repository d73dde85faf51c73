#include "platform/base/Clock.h"
#include "platform/base/Log.h"
#include "platform/files/FileManager.h"
#include "platform/files/ItemWatch.h"
#include "platform/system/EventThread.h"
#include "platform/system/HostRoute.h"
#include "platform/system/MeteredConnection.h"
#include "platform/system/NetworkNotices.h"
#include "platform/system/ReachabilityReports.h"

#include <algorithm>
#include <map>
#include <utility>

namespace platform {
namespace {

/// Notices of the kernel come in bursts; one look after this long serves them all.
constexpr Duration settleTime = std::chrono::milliseconds(100);
/// A name that nobody could resolve is asked for again, at first this soon, at last this seldom.
constexpr Duration firstRetry = std::chrono::seconds(5);
constexpr Duration lastRetry = std::chrono::minutes(1);

/// Looks, on a queue that may take long (names are looked up, dead disks answer late). Whoever
/// closes it does not wait for that: what is still looked at then finds itself alone and ends.
class Prober : public std::enable_shared_from_this<Prober> {
public:
    explicit Prober(Clock& clock) : clock_(&clock) {}

    std::unique_ptr<ReachabilityTarget> makeTarget(const std::string& host) {
        auto target = targets_.make(host);
        lookNow();
        return target;
    }

    void setRemote(const std::optional<WatchedRemote>& remote) {
        {
            const std::lock_guard lock(mutex_);
            remote_ = remote;
        }
        enqueue(&Prober::watchFolder);
        lookNow();
    }

    void setCellular(bool cellular) {
        {
            const std::lock_guard lock(mutex_);
            cellular_ = cellular;
        }
        lookNow();
    }

    /// From any thread, as often as one likes.
    void lookSoon() { lookAfter(settleTime); }

    void lookNow() { enqueue(&Prober::look); }

    /// Nothing of the platform is used after this.
    void close() {
        const std::lock_guard lock(mutex_);
        if (alarm_ != 0)
            clock_->cancelAlarm(std::exchange(alarm_, 0));
        clock_ = nullptr;
        watch_.reset();
    }

private:
    /// What runs holds the queue, so that nobody who lets go of it waits for its end.
    void enqueue(void (Prober::*work)()) {
        queue_->async([weak = weak_from_this(), queue = queue_, work] {
            if (const auto self = weak.lock())
                (self.get()->*work)();
        });
    }

    std::optional<WatchedRemote> remote() {
        const std::lock_guard lock(mutex_);
        return remote_;
    }

    void lookAfter(Duration delay) {
        const std::lock_guard lock(mutex_);
        const Duration due = clock_ ? clock_->monotonic() + delay : Duration{};
        if (!clock_ || (alarm_ != 0 && alarmDue_ <= due))
            return;
        if (alarm_ != 0)
            clock_->cancelAlarm(alarm_);
        alarmDue_ = due;
        alarm_ = clock_->setAlarm(delay, [weak = weak_from_this()] {
            if (const auto self = weak.lock())
                self->alarmRang();
        });
    }

    void alarmRang() {
        {
            const std::lock_guard lock(mutex_);
            alarm_ = 0;
        }
        lookNow();
    }

    /// On the queue.
    void look() {
        const std::optional<WatchedRemote> remote = this->remote();
        bool unresolved = false;
        for (const auto& target : targets_.living()) {
            if (remote && !remote->folder.empty())
                target->tell(folderFlags(remote->folder));
            else
                target->tell(hostFlags(remote ? remote->host : target->host(), unresolved));
        }
        if (!unresolved)
            retry_ = firstRetry;
        else
            lookAfter(std::exchange(retry_, std::min(retry_ * 2, lastRetry)));
    }

    /// A folder is on a disk of this machine as far as anybody can tell, so it is never cellular.
    static std::uint32_t folderFlags(const std::string& folder) {
        bool isFolder = false;
        const bool there = FileManager::exists(folder, &isFolder) && isFolder;
        return there ? std::uint32_t(reachabilityReachable) : 0;
    }

    std::uint32_t hostFlags(const std::string& host, bool& unresolved) {
        auto found = routes_.try_emplace(host, host).first;
        const HostRoute::State state = found->second.look();
        unresolved = unresolved || state == HostRoute::State::unresolved;
        if (state == HostRoute::State::local)
            return reachabilityReachable;
        if (state != HostRoute::State::there)
            return 0;
        const std::lock_guard lock(mutex_);
        return cellular_ ? reachabilityReachable | reachabilityCellular : reachabilityReachable;
    }

    /// On the queue. Making a watch touches the disk, so nobody is kept waiting for it.
    void watchFolder() {
        const std::optional<WatchedRemote> remote = this->remote();
        std::unique_ptr<FolderWatch> next;
        if (remote && !remote->folder.empty())
            next = std::make_unique<FolderWatch>(remote->folder, watcher_, queue_,
                                                 [weak = weak_from_this()] {
                                                     if (const auto self = weak.lock())
                                                         self->lookNow();
                                                 });
        const std::lock_guard lock(mutex_);
        if (clock_)
            watch_.swap(next);
    }

    struct FolderWatch {
        FolderWatch(const std::string& folder, std::shared_ptr<DirectoryWatcher> theWatcher,
                    std::shared_ptr<WorkQueue> theQueue, Job touched)
            : watcher(std::move(theWatcher)),
              queue(std::move(theQueue)),
              watch(*watcher, folder, ItemWatch::Scope::item, *queue, std::move(touched)) {}
        std::shared_ptr<DirectoryWatcher> watcher;
        std::shared_ptr<WorkQueue> queue;
        ItemWatch watch;
    };

    ReachabilityTargets targets_;
    std::shared_ptr<DirectoryWatcher> watcher_ = std::make_shared<DirectoryWatcher>();
    std::shared_ptr<WorkQueue> queue_ =
        std::make_shared<WorkQueue>("platform.reachability", WorkPriority::utility);
    std::map<std::string, HostRoute> routes_; // of the queue, as is the next
    Duration retry_ = firstRetry;
    std::mutex mutex_;
    Clock* clock_; // guarded by mutex_, as is all that follows; none once closed
    std::optional<WatchedRemote> remote_;
    bool cellular_ = false;
    Clock::AlarmId alarm_ = 0;
    Duration alarmDue_{};
    std::unique_ptr<FolderWatch> watch_;
};

class LiveReachability final : public ReachabilityService {
public:
    explicit LiveReachability(Clock& clock)
        : prober_(std::make_shared<Prober>(clock)),
          thread_(EventThread::create("platform.network")) {
        if (!thread_)
            return;
        thread_->sync([this] {
            notices_ = std::make_unique<NetworkNotices>(*thread_,
                                                        [prober = prober_] { prober->lookSoon(); });
            metered_ = std::make_unique<MeteredConnection>(
                *thread_, [prober = prober_](bool cellular) { prober->setCellular(cellular); });
        });
    }

    ~LiveReachability() override {
        if (thread_)
            thread_->sync([this] {
                notices_.reset();
                metered_.reset();
            });
        prober_->close();
    }

    std::unique_ptr<ReachabilityTarget> createTarget(const std::string& host) override {
        return thread_ && !host.empty() ? prober_->makeTarget(host) : nullptr;
    }

    void setWatchedRemote(const std::optional<WatchedRemote>& remote) override {
        prober_->setRemote(remote);
    }

private:
    std::shared_ptr<Prober> prober_;
    std::unique_ptr<EventThread> thread_;
    std::unique_ptr<NetworkNotices> notices_; // of the thread, as is the next
    std::unique_ptr<MeteredConnection> metered_;
};

} // namespace

std::unique_ptr<ReachabilityService> makeLiveReachability(Clock& clock) {
    return std::make_unique<LiveReachability>(clock);
}

} // namespace platform
