#include "platform/files/DirectoryWatcher.h"

#include "platform/base/Error.h"
#include "platform/base/Log.h"
#include "platform/files/FilesClock.h"
#include "platform/files/InotifyLoop.h"

#include <cerrno>
#include <set>

namespace platform {
namespace {

/// How often a folder is reported as overflown for which the machine has no watch left.
constexpr Duration rescanInterval = std::chrono::seconds(30);

bool isLimit(int number) {
    return number == ENOSPC || number == EMFILE || number == ENFILE || number == ENOMEM;
}

void sayLimitOnce() {
    static std::atomic<bool> said{false};
    if (!said.exchange(true))
        platformLogLater(LogLevel::warning,
                         "The system's limit of watched folders is reached; some "
                         "folders are read again every half minute instead. Raise "
                         "fs.inotify.max_user_watches to avoid this.");
}

} // namespace

struct DirectoryWatcher::State : std::enable_shared_from_this<State> {
    using Registration = std::shared_ptr<WatchRegistration>;
    std::mutex mutex;
    std::set<Registration> all;
    /// Those that the kernel does not watch for us.
    std::set<Registration> unwatched;
    bool rescanPending = false;

    ~State() {
        for (const Registration& registration : all)
            end(registration);
    }

    static void end(const Registration& registration) {
        registration->end();
        InotifyLoop::shared().remove(*registration);
    }

    void forget(const Registration& registration) {
        {
            const std::lock_guard lock(mutex);
            all.erase(registration);
            unwatched.erase(registration);
        }
        end(registration);
    }

    void addUnwatched(const Registration& registration) {
        sayLimitOnce();
        const std::lock_guard lock(mutex);
        unwatched.insert(registration);
        if (!rescanPending)
            scheduleRescan();
    }

    /// Called with the lock held.
    void scheduleRescan() {
        rescanPending = true;
        filesClock().setAlarm(rescanInterval, [weak = weak_from_this()] {
            if (const auto self = weak.lock())
                self->rescan();
        });
    }

    void rescan() {
        std::set<Registration> waiting;
        {
            const std::lock_guard lock(mutex);
            waiting = unwatched;
        }
        for (const Registration& registration : waiting) {
            const int number = InotifyLoop::shared().add(registration);
            if (!isLimit(number)) {
                const std::lock_guard lock(mutex);
                unwatched.erase(registration);
            }
            const bool gone = number != 0 && !isLimit(number);
            const auto kind =
                gone ? DirectoryChange::Kind::folderGone : DirectoryChange::Kind::overflow;
            registration->report({{kind, {}, true, 0}});
            if (!registration->active()) // dropped meanwhile
                InotifyLoop::shared().remove(*registration);
        }
        const std::lock_guard lock(mutex);
        rescanPending = false;
        if (!unwatched.empty())
            scheduleRescan();
    }
};

DirectoryWatcher::DirectoryWatcher() : state_(std::make_shared<State>()) {
}

DirectoryWatcher::~DirectoryWatcher() = default;

DirectoryWatcher::Token DirectoryWatcher::watch(const Url& folder, Executor& queue,
                                                Handler handler) {
    const auto registration =
        std::make_shared<WatchRegistration>(folder.path(), queue, std::move(handler));
    const int number = InotifyLoop::shared().add(registration);
    if (number != 0 && !isLimit(number)) {
        platformLogLater(LogLevel::warning, "Cannot watch the folder %@: %@", folder,
                         posixError(number, folder, false));
        return {};
    }
    {
        const std::lock_guard lock(state_->mutex);
        state_->all.insert(registration);
    }
    if (number != 0)
        state_->addUnwatched(registration);
    // Only the address is handed out; what matters is what runs when the last copy goes.
    return {registration.get(), [weak = std::weak_ptr(state_), registration](void*) {
                if (const auto state = weak.lock())
                    state->forget(registration);
            }};
}

} // namespace platform
