#pragma once

#include "platform/base/Url.h"

#include <atomic>
#include <cstdint>
#include <functional>
#include <memory>
#include <mutex>
#include <string>
#include <string_view>
#include <vector>

namespace platform {

/// The kind of a progress that counts a file's bytes.
inline constexpr std::string_view fileProgressKind = "FileProgressKind";

/// How far a piece of work is. Written by one worker, read and observed from any thread.
class Progress {
public:
    using Observer = std::function<void(const Progress& progress)>;
    using ObserverId = std::uint64_t;

    explicit Progress(std::string kind, std::int64_t total = 0)
        : kind_(std::move(kind)), total_(total) {}

    const std::string& kind() const { return kind_; }
    std::int64_t completedUnitCount() const { return completed_.load(std::memory_order_relaxed); }
    std::int64_t totalUnitCount() const { return total_.load(std::memory_order_relaxed); }
    /// 0 while the total is unknown.
    double fractionCompleted() const;

    /// Tells the observers on the calling thread.
    void update(std::int64_t completed, std::int64_t total);

    /// Called on the worker's thread after every update. Not called any more once
    /// removeObserver() has returned, unless that is called from within the observer.
    ObserverId addObserver(Observer observer);
    void removeObserver(ObserverId id);

private:
    std::string kind_;
    std::atomic<std::int64_t> completed_{0};
    std::atomic<std::int64_t> total_{0};
    std::recursive_mutex mutex_;
    std::vector<std::pair<ObserverId, std::shared_ptr<Observer>>> observers_; // guarded by mutex_
    ObserverId lastId_ = 0;
};

void appendDescription(std::string& out, const Progress& progress);

/// Publishes the progress of files to whoever subscribed to their URL. Safe from any thread.
class FileProgressSubscription {
public:
    using Unpublished = std::function<void()>;
    /// Called for each progress published for the file, also for one that is under way already;
    /// answers what to call, once, when that progress is withdrawn or the subscription ends (may
    /// be empty). Runs on the thread that publishes or subscribes.
    using Published = std::function<Unpublished(const std::shared_ptr<Progress>& progress)>;
    using Token = std::shared_ptr<void>;

    FileProgressSubscription();
    ~FileProgressSubscription();
    FileProgressSubscription(const FileProgressSubscription&) = delete;
    FileProgressSubscription& operator=(const FileProgressSubscription&) = delete;

    /// Subscribed until the token is removed (or dropped). Nothing is called for it any more once
    /// removeSubscriber() has returned, unless that is called from within an observer of a progress
    /// or one of these handlers.
    [[nodiscard]] Token addSubscriber(const Url& file, Published handler);
    void removeSubscriber(const Token& token);

    /// Publishes until the answered token is dropped.
    [[nodiscard]] Token publish(const Url& file, std::shared_ptr<Progress> progress);

private:
    struct State;
    std::shared_ptr<State> state_;
};

} // namespace platform
