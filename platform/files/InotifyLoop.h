#pragma once

#include "platform/files/DirectoryWatcher.h"
#include "platform/files/FileDescriptor.h"

#include <atomic>
#include <mutex>
#include <unordered_map>

struct inotify_event;

namespace platform {

/// One folder that somebody watches. Reports stop with end().
class WatchRegistration : public std::enable_shared_from_this<WatchRegistration> {
public:
    WatchRegistration(std::string path, Executor& queue, DirectoryWatcher::Handler handler)
        : path_(std::move(path)), queue_(queue), handler_(std::move(handler)) {}

    const std::string& path() const { return path_; }
    bool active() const { return active_; }
    void report(std::vector<DirectoryChange> changes);
    /// Nothing is handed to the queue any more once this has returned.
    void end();

    /// The kernel's number of the watch; -1 for none. Belongs to the loop.
    int watch = -1;

private:
    std::string path_;
    Executor& queue_;
    DirectoryWatcher::Handler handler_;
    /// Held while the queue is used; a queue that runs jobs at once may come back here.
    std::recursive_mutex mutex_;
    std::atomic<bool> active_{true};
};

/// The process's one inotify instance and the thread that reads it. The thread lives as long as the
/// process; the instance is closed while nothing is watched. Safe from any thread.
class InotifyLoop {
public:
    static InotifyLoop& shared();

    /// Answers 0 or an errno (ENOSPC, EMFILE: the machine's limits).
    int add(const std::shared_ptr<WatchRegistration>& registration);
    void remove(WatchRegistration& registration);

private:
    using Watches = std::unordered_map<int, std::vector<std::shared_ptr<WatchRegistration>>>;
    using Batch = std::unordered_map<int, std::vector<DirectoryChange>>;

    InotifyLoop() = default;
    int open();
    void run();
    void wait(int instance) const;
    bool readOnce(int instance);
    void sort(const inotify_event& event, Batch& batch) const;
    void closeWhenIdle();

    std::mutex mutex_;
    Watches watches_; // guarded by mutex_
    FileDescriptor instance_;
    /// Wakes the thread when the instance is new or nothing is watched any more.
    FileDescriptor wake_;
    bool running_ = false;
};

} // namespace platform
