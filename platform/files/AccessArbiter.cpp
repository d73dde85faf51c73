#include "platform/files/AccessArbiter.h"

#include "platform/files/ItemPaths.h"

#include <algorithm>

namespace platform {
namespace {

bool isWrite(AccessKind kind) {
    return kind == AccessKind::contentWrite || kind == AccessKind::structuralWrite;
}

bool conflict(const AccessClaim::Path& a, const AccessClaim::Path& b) {
    if (!isWrite(a.kind) && !isWrite(b.kind))
        return false;
    // Attributes do not wait for content. A folder's own attributes can be read while something in
    // it is moved, but not while the folder itself is.
    if (a.kind == AccessKind::metadata)
        return b.kind == AccessKind::structuralWrite && isAtOrBelow(a.path, b.path);
    if (b.kind == AccessKind::metadata)
        return conflict(b, a);
    return pathsMeet(a.path, b.path);
}

bool conflict(const std::vector<AccessClaim::Path>& a, const std::vector<AccessClaim::Path>& b) {
    for (const AccessClaim::Path& one : a)
        for (const AccessClaim::Path& other : b)
            if (conflict(one, other))
                return true;
    return false;
}

bool isMetadata(const std::vector<AccessClaim::Path>& paths) {
    return std::all_of(paths.begin(), paths.end(),
                       [](const auto& one) { return one.kind == AccessKind::metadata; });
}

bool writes(const std::vector<AccessClaim::Path>& paths) {
    return std::any_of(paths.begin(), paths.end(),
                       [](const auto& one) { return isWrite(one.kind); });
}

template<class T>
bool contains(const std::vector<T>& list, const T& one) {
    return std::find(list.begin(), list.end(), one) != list.end();
}

} // namespace

AccessArbiter& AccessArbiter::shared() {
    static AccessArbiter* const arbiter = new AccessArbiter(); // lives as long as the process
    return *arbiter;
}

AccessArbiter::Outcome AccessArbiter::acquire(AccessClaim& claim) {
    std::unique_lock lock(mutex_);
    claim.stage_ = AccessClaim::Stage::waiting; // it may have been granted and released before
    if (claim.cancel_.isCancelled())
        return Outcome::cancelled;
    if (canBeGranted(claim)) {
        claim.stage_ = AccessClaim::Stage::active;
        active_.push_back(&claim);
        return Outcome::granted;
    }
    if (closesCircle(claim))
        return Outcome::wouldNeverEnd;
    waiting_.push_back(&claim);
    return await(claim, lock);
}

AccessArbiter::Outcome AccessArbiter::await(AccessClaim& claim,
                                            std::unique_lock<std::mutex>& lock) {
    claim.changed_.wait(lock, [&claim] {
        return claim.stage_ == AccessClaim::Stage::active || claim.cancel_.isCancelled();
    });
    if (claim.stage_ == AccessClaim::Stage::active)
        return Outcome::granted;
    std::erase(waiting_, &claim);
    grantWaiting(); // those who waited behind it
    return Outcome::cancelled;
}

void AccessArbiter::release(AccessClaim& claim) {
    const std::lock_guard lock(mutex_);
    std::erase(active_, &claim);
    grantWaiting();
}

void AccessArbiter::yield(AccessClaim& claim, std::vector<const void*> presenters) {
    const std::lock_guard lock(mutex_);
    claim.stage_ = AccessClaim::Stage::yielding;
    claim.asked_ = std::move(presenters);
    grantWaiting();
}

AccessArbiter::Outcome AccessArbiter::resume(AccessClaim& claim) {
    std::unique_lock lock(mutex_);
    std::erase(active_, &claim);
    claim.asked_.clear();
    claim.stage_ = AccessClaim::Stage::waiting;
    // Whoever came in meanwhile may be about to wait for what this thread holds outside this claim.
    if (!canBeGranted(claim) && closesCircle(claim)) {
        grantWaiting();
        return Outcome::wouldNeverEnd;
    }
    waiting_.push_front(&claim);
    grantWaiting();
    return await(claim, lock);
}

void AccessArbiter::beginFetching(AccessClaim& claim) {
    const std::lock_guard lock(mutex_);
    fetching_.push_back(&claim);
}

void AccessArbiter::endFetching(AccessClaim& claim) {
    const std::lock_guard lock(mutex_);
    std::erase(fetching_, &claim);
}

std::string AccessArbiter::pathWhileFetching(const AccessClaim& claim, std::size_t index) {
    const std::lock_guard lock(mutex_);
    return claim.path(index);
}

void AccessArbiter::wake() {
    const std::lock_guard lock(mutex_);
    for (AccessClaim* claim : waiting_)
        claim->changed_.notify_all();
}

void AccessArbiter::itemMoved(const std::string& from, const std::string& to) {
    const auto follow = [&](AccessClaim* claim) {
        for (AccessClaim::Path& one : claim->paths_)
            if (one.follows)
                one.path = movedPath(one.path, from, to);
    };
    const std::lock_guard lock(mutex_);
    std::for_each(waiting_.begin(), waiting_.end(), follow);
    std::for_each(fetching_.begin(), fetching_.end(), follow);
    grantWaiting();
}

/// Called with the lock held, whenever something that may have blocked a claim is gone.
void AccessArbiter::grantWaiting() {
    for (std::size_t i = 0; i < waiting_.size();) {
        AccessClaim* const claim = waiting_[i];
        if (!canBeGranted(*claim)) {
            ++i;
            continue;
        }
        waiting_.erase(waiting_.begin() + static_cast<std::ptrdiff_t>(i));
        active_.push_back(claim);
        claim->stage_ = AccessClaim::Stage::active;
        claim->changed_.notify_all();
    }
}

bool AccessArbiter::canBeGranted(const AccessClaim& claim) const {
    if (blockedByActive(claim, true))
        return false;
    return waiting_.empty() || isNested(claim) || !blockedByWaiting(claim);
}

bool AccessArbiter::blockedByActive(const AccessClaim& claim, bool byMetadataToo) const {
    return std::any_of(active_.begin(), active_.end(), [&](const AccessClaim* other) {
        if (other->thread_ == claim.thread_ || other->owner_ == claim.owner_)
            return false;
        if (!byMetadataToo && isMetadata(other->paths_))
            return false;
        if (!conflict(other->paths_, claim.paths_))
            return false;
        if (other->stage_ != AccessClaim::Stage::yielding)
            return true;
        return writes(claim.paths_) &&
               (!claim.presenter_ || !contains(other->asked_, claim.presenter_));
    });
}

/// Whether an earlier claim has the right to go first. Attributes are let past one that waits for
/// content itself, else they would wait for that content as well; but not past one that waits for
/// readers of attributes only, else a stream of those could keep it waiting for ever.
bool AccessArbiter::blockedByWaiting(const AccessClaim& claim) const {
    const bool metadata = isMetadata(claim.paths_);
    for (auto it = waiting_.begin(); it != waiting_.end() && *it != &claim; ++it) {
        const AccessClaim& earlier = **it;
        if (!conflict(earlier.paths_, claim.paths_))
            continue;
        if (!metadata)
            return true;
        const bool behindOthers = std::any_of(waiting_.begin(), it, [&](const AccessClaim* first) {
            return !isMetadata(first->paths_) && conflict(first->paths_, earlier.paths_);
        });
        if (!behindOthers && !blockedByActive(earlier, false))
            return true;
    }
    return false;
}

bool AccessArbiter::isNested(const AccessClaim& claim) const {
    return std::any_of(active_.begin(), active_.end(), [&](const AccessClaim* other) {
        return other->thread_ == claim.thread_ || other->owner_ == claim.owner_;
    });
}

/// Whether waiting would be waiting for oneself, by way of others who hold something and wait. Only
/// who holds something can be waited for, so the circle is closed by a nested claim.
bool AccessArbiter::closesCircle(const AccessClaim& claim) const {
    Claims seen;
    return isNested(claim) && waitsFor(claim, claim.thread_, seen);
}

bool AccessArbiter::waitsFor(const AccessClaim& claim, std::thread::id thread, Claims& seen) const {
    for (const AccessClaim* holder : active_) {
        if (holder->thread_ == claim.thread_ || !conflict(holder->paths_, claim.paths_))
            continue;
        if (holder->thread_ == thread)
            return true;
        for (AccessClaim* next : waiting_) {
            if (next->thread_ != holder->thread_ || contains(seen, next))
                continue;
            seen.push_back(next);
            if (waitsFor(*next, thread, seen))
                return true;
        }
    }
    return false;
}

} // namespace platform
