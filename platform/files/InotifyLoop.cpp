#include "platform/files/InotifyLoop.h"

#include <array>
#include <cerrno>
#include <poll.h>
#include <pthread.h>
#include <span>
#include <sys/eventfd.h>
#include <sys/inotify.h>
#include <thread>
#include <utility>

namespace platform {
namespace {

constexpr std::uint32_t watchedEvents = IN_CREATE | IN_DELETE | IN_MODIFY | IN_CLOSE_WRITE |
                                        IN_ATTRIB | IN_MOVED_FROM | IN_MOVED_TO | IN_DELETE_SELF |
                                        IN_MOVE_SELF | IN_EXCL_UNLINK | IN_ONLYDIR;

DirectoryChange::Kind kindOfEvent(std::uint32_t mask) {
    using Kind = DirectoryChange::Kind;
    if (mask & (IN_DELETE_SELF | IN_MOVE_SELF | IN_UNMOUNT | IN_IGNORED))
        return Kind::folderGone;
    if (mask & IN_CREATE)
        return Kind::created;
    if (mask & IN_DELETE)
        return Kind::removed;
    if (mask & IN_MOVED_FROM)
        return Kind::movedFrom;
    if (mask & IN_MOVED_TO)
        return Kind::movedTo;
    return mask & IN_ATTRIB ? Kind::attributes : Kind::modified;
}

/// The longest event: a name of 255 bytes and its end.
constexpr std::size_t longestEvent = sizeof(inotify_event) + 256;
/// A rename is two events, which the kernel writes one after the other. A reader that is fast
/// enough comes between them; the second one is there a moment later.
constexpr int renameGap = 2; // milliseconds
constexpr int mostRenameWaits = 8;

/// Whether the last of the events may be the first half of a rename.
bool endsInHalfARename(const char* events, std::size_t length) {
    std::uint32_t last = 0;
    for (std::size_t at = 0; at < length;) {
        const auto* event = reinterpret_cast<const inotify_event*>(events + at);
        last = event->mask;
        at += sizeof(inotify_event) + event->len;
    }
    return (last & IN_MOVED_FROM) != 0;
}

/// Reads events, both halves of a rename together. Answers their bytes; 0 when there are none.
std::size_t readEvents(int instance, std::span<char> buffer) {
    std::size_t length = 0;
    for (int waits = 0; buffer.size() - length >= longestEvent; ++waits) {
        const ssize_t more = ::read(instance, buffer.data() + length, buffer.size() - length);
        if (more <= 0)
            break;
        length += static_cast<std::size_t>(more);
        pollfd next{instance, POLLIN, 0};
        if (waits == mostRenameWaits || !endsInHalfARename(buffer.data(), length) ||
            ::poll(&next, 1, renameGap) <= 0)
            break;
    }
    return length;
}

/// The folder's own change of attributes arrives without a name; its watchers hear of entries only.
bool concernsWatcher(const inotify_event& event) {
    const bool gone = kindOfEvent(event.mask) == DirectoryChange::Kind::folderGone;
    return gone || event.len > 0;
}

bool repeats(const std::vector<DirectoryChange>& changes, const DirectoryChange& next) {
    using Kind = DirectoryChange::Kind;
    if (changes.empty() || (next.kind != Kind::modified && next.kind != Kind::attributes))
        return false;
    return changes.back().kind == next.kind && changes.back().name == next.name;
}

} // namespace

void WatchRegistration::report(std::vector<DirectoryChange> changes) {
    const std::lock_guard lock(mutex_);
    if (!active_)
        return;
    queue_.async([weak = weak_from_this(), changes = std::move(changes)] {
        const auto self = weak.lock();
        if (self && self->active_)
            self->handler_(changes);
    });
}

void WatchRegistration::end() {
    const std::lock_guard lock(mutex_);
    active_ = false;
}

InotifyLoop& InotifyLoop::shared() {
    static InotifyLoop* const loop = new InotifyLoop(); // lives as long as the process
    return *loop;
}

/// Called with the lock held. Makes the instance and the thread when there is none.
int InotifyLoop::open() {
    if (!wake_)
        wake_ = FileDescriptor(::eventfd(0, EFD_CLOEXEC | EFD_NONBLOCK));
    if (!wake_)
        return errno;
    if (!instance_) {
        instance_ = FileDescriptor(::inotify_init1(IN_CLOEXEC | IN_NONBLOCK));
        if (!instance_)
            return errno;
        ::eventfd_write(wake_.get(), 1);
    }
    if (!running_) {
        running_ = true;
        std::thread([this] { run(); }).detach();
    }
    return 0;
}

int InotifyLoop::add(const std::shared_ptr<WatchRegistration>& registration) {
    const std::lock_guard lock(mutex_);
    if (const int number = open())
        return number;
    const int watch =
        ::inotify_add_watch(instance_.get(), registration->path().c_str(), watchedEvents);
    if (watch < 0)
        return errno;
    watches_[watch].push_back(registration);
    registration->watch = watch;
    return 0;
}

void InotifyLoop::remove(WatchRegistration& registration) {
    const std::lock_guard lock(mutex_);
    const auto found = watches_.find(std::exchange(registration.watch, -1));
    if (found == watches_.end())
        return;
    std::erase_if(found->second, [&](const auto& one) { return one.get() == &registration; });
    if (!found->second.empty())
        return;
    ::inotify_rm_watch(instance_.get(), found->first);
    watches_.erase(found);
    if (watches_.empty())
        ::eventfd_write(wake_.get(), 1);
}

void InotifyLoop::run() {
    pthread_setname_np(pthread_self(), "inotify");
    for (;;) {
        int instance = -1;
        {
            const std::lock_guard lock(mutex_);
            closeWhenIdle();
            instance = instance_.get();
        }
        wait(instance);
        while (instance >= 0 && readOnce(instance)) {
        }
    }
}

/// Called with the lock held, on the thread: nobody else closes what the thread may be reading.
void InotifyLoop::closeWhenIdle() {
    if (watches_.empty())
        instance_.reset();
}

void InotifyLoop::wait(int instance) const {
    std::array<pollfd, 2> sources{pollfd{wake_.get(), POLLIN, 0}, pollfd{instance, POLLIN, 0}};
    ::poll(sources.data(), instance < 0 ? 1 : 2, -1);
    eventfd_t ignored = 0;
    ::eventfd_read(wake_.get(), &ignored);
}

/// Hands on one buffer of events. Answers false when there are no more.
bool InotifyLoop::readOnce(int instance) {
    alignas(inotify_event) std::array<char, 64 * 1024> buffer; // NOLINT: read() fills it
    const std::size_t length = readEvents(instance, buffer);
    if (length == 0)
        return false;
    std::vector<std::pair<std::shared_ptr<WatchRegistration>, std::vector<DirectoryChange>>> out;
    {
        const std::lock_guard lock(mutex_);
        Batch batch;
        for (std::size_t at = 0; at < length;) {
            const auto* event = reinterpret_cast<const inotify_event*>(buffer.data() + at);
            at += sizeof(inotify_event) + event->len;
            sort(*event, batch);
        }
        for (auto& [watch, changes] : batch) {
            const auto found = watches_.find(watch);
            if (found == watches_.end())
                continue;
            const bool gone = changes.back().kind == DirectoryChange::Kind::folderGone;
            for (const auto& registration : found->second) {
                out.emplace_back(registration, changes);
                if (gone)
                    registration->watch = -1;
            }
            if (!gone)
                continue;
            ::inotify_rm_watch(instance, watch);
            watches_.erase(found);
        }
    }
    for (auto& [registration, changes] : out)
        registration->report(std::move(changes));
    return true;
}

/// Called with the lock held. Adds the event to the changes of its folder.
void InotifyLoop::sort(const inotify_event& event, Batch& batch) const {
    if (event.mask & IN_Q_OVERFLOW) {
        for (const auto& one : watches_)
            batch[one.first].push_back({DirectoryChange::Kind::overflow, {}, false, 0});
        return;
    }
    if (!concernsWatcher(event) || !watches_.contains(event.wd))
        return;
    DirectoryChange change;
    change.kind = kindOfEvent(event.mask);
    change.isDirectory = (event.mask & IN_ISDIR) != 0;
    change.cookie = event.cookie;
    if (event.len > 0)
        change.name = event.name;
    std::vector<DirectoryChange>& changes = batch[event.wd];
    const bool over = !changes.empty() && changes.back().kind == DirectoryChange::Kind::folderGone;
    if (!over && !repeats(changes, change))
        changes.push_back(std::move(change));
}

} // namespace platform
