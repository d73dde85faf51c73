#pragma once

#include "platform/base/WorkQueue.h"
#include "platform/files/FileCoordinator.h"

#include <algorithm>
#include <condition_variable>
#include <filesystem>
#include <mutex>
#include <vector>

namespace test {

/// Presents one item and writes down what it hears, by the items' names: "changed", "moved to b",
/// "deletion", "deletion of part c".
class Presenter final : public platform::FilePresenter {
public:
    static std::shared_ptr<Presenter> present(const platform::Url& item) {
        auto presenter = std::make_shared<Presenter>();
        presenter->setUrl(item);
        platform::FileCoordinator::addFilePresenter(presenter);
        return presenter;
    }
    ~Presenter() override { platform::FileCoordinator::removeFilePresenter(this); }

    void setUrl(std::optional<platform::Url> url) {
        const std::lock_guard lock(mutex_);
        url_ = std::move(url);
    }
    void useQueue(std::shared_ptr<platform::Executor> queue) { queue_ = std::move(queue); }
    /// Runs on the presenter's queue within every notice, after it was written down.
    std::function<void()> duringNotice;
    /// What a deletion is answered with; with none, the handler is kept in `unanswered`.
    std::optional<platform::Failure> answer = platform::Failure();
    std::vector<DeletionHandler> unanswered;

    std::optional<platform::Url> presentedItemURL() const override {
        const std::lock_guard lock(mutex_);
        return url_;
    }
    std::shared_ptr<platform::Executor> presentedItemOperationQueue() const override {
        return queue_;
    }
    void presentedItemDidChange() override { note("changed"); }
    void presentedItemDidMoveToURL(const platform::Url& url) override {
        note("moved to " + std::string(url.lastPathComponent()));
    }
    void accommodatePresentedItemDeletionWithCompletionHandler(DeletionHandler handler) override {
        note("deletion");
        give(std::move(handler));
    }
    void accommodatePresentedSubitemDeletionAtURL(const platform::Url& part,
                                                  DeletionHandler handler) override {
        note("deletion of part " + std::string(part.lastPathComponent()));
        give(std::move(handler));
    }

    /// Waits until the notices that were handed to its queue have been heard.
    void drain() const {
        if (const auto work = std::dynamic_pointer_cast<platform::WorkQueue>(queue_))
            work->sync([] {});
    }
    /// Waits until that many notices have come.
    bool waitForNotices(std::size_t count) {
        std::unique_lock lock(mutex_);
        return heard_.wait_for(lock, std::chrono::seconds(20),
                               [&] { return notices_.size() >= count; });
    }
    std::vector<std::string> notices() const {
        const std::lock_guard lock(mutex_);
        return notices_;
    }

private:
    void note(std::string text) {
        {
            const std::lock_guard lock(mutex_);
            notices_.push_back(std::move(text));
            heard_.notify_all();
        }
        if (duringNotice)
            duringNotice();
    }
    void give(DeletionHandler handler) {
        if (answer)
            handler(*answer);
        else
            unanswered.push_back(std::move(handler));
    }

    mutable std::mutex mutex_;
    std::condition_variable heard_;
    std::optional<platform::Url> url_;
    std::vector<std::string> notices_;
    std::shared_ptr<platform::Executor> queue_ =
        std::make_shared<platform::WorkQueue>("test.presenter");
};

} // namespace test
