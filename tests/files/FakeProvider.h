#pragma once

#include "platform/files/FileCoordinator.h"

#include <condition_variable>
#include <mutex>
#include <set>

namespace test {

/// A content provider whose downloads end when the test says so.
class FakeProvider final : public platform::ContentProvider {
public:
    FakeProvider() { platform::FileCoordinator::setContentProvider(this); }
    ~FakeProvider() override { platform::FileCoordinator::setContentProvider(nullptr); }

    void promise(const platform::Url& item) {
        const std::lock_guard lock(mutex_);
        promised_.insert(item.path());
    }
    /// The promise goes without its content having come.
    void forget(const platform::Url& item) {
        const std::lock_guard lock(mutex_);
        promised_.erase(item.path());
    }
    bool isPromised(const platform::Url& item) const override {
        const std::lock_guard lock(mutex_);
        return promised_.contains(item.path());
    }
    platform::Failure makeLocal(const platform::Url& item, platform::CancelFlag& cancel) override {
        cancel.setHandler([this] {
            const std::lock_guard lock(mutex_); // else a wait that just begins would miss it
            changed_.notify_all();
        });
        std::unique_lock lock(mutex_);
        ++started_;
        changed_.notify_all();
        changed_.wait(lock, [&] { return finished_ >= started_ || cancel.isCancelled(); });
        lock.unlock();
        cancel.setHandler(nullptr);
        if (cancel.isCancelled())
            return makeError(platform::ErrorCode::userCancelled);
        lock.lock();
        if (failure_)
            return failure_;
        promised_.erase(item.path());
        return std::nullopt;
    }
    platform::Failure moveItem(const platform::Url&, const platform::Url&) override { return {}; }

    void waitForDownloads(int count) {
        std::unique_lock lock(mutex_);
        changed_.wait_for(lock, std::chrono::seconds(20), [&] { return started_ >= count; });
    }
    /// Lets that many downloads end, in all.
    void finish(int count, platform::Failure failure = {}) {
        const std::lock_guard lock(mutex_);
        finished_ = count;
        failure_ = std::move(failure);
        changed_.notify_all();
    }
    int started() const {
        const std::lock_guard lock(mutex_);
        return started_;
    }

private:
    mutable std::mutex mutex_;
    std::condition_variable changed_;
    std::set<std::string> promised_;
    int started_ = 0;
    int finished_ = 0;
    platform::Failure failure_;
};

} // namespace test
