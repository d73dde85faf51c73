#pragma once

#include "platform/files/ContentProvider.h"

#include <condition_variable>
#include <deque>
#include <string>
#include <thread>
#include <vector>

namespace platform {

/// What a claim is for. Only moving and deleting are structural: they are short, and the attributes
/// of their item make no sense meanwhile.
enum class AccessKind { metadata, read, contentWrite, structuralWrite };

/// The right to one or two paths, asked for at once so that two claims cannot hold each other up.
/// Lives on the stack of the thread that asks.
class AccessClaim {
public:
    struct Path {
        std::string path;
        AccessKind kind;
        /// While it waits, the claim goes along when somebody moves the item.
        bool follows = true;
    };

    /// `owner` tells coordinators apart; `presenter` is the one on whose behalf it asks (may be
    /// none).
    AccessClaim(const void* owner, const void* presenter, const CancelFlag& cancel)
        : owner_(owner), presenter_(presenter), cancel_(cancel) {}
    AccessClaim(const AccessClaim&) = delete;
    AccessClaim& operator=(const AccessClaim&) = delete;

    /// Before acquire(); once that has granted the claim, path() tells for what.
    void add(std::string path, AccessKind kind, bool follows = true) {
        paths_.push_back({std::move(path), kind, follows});
    }
    const std::string& path(std::size_t index) const { return paths_[index].path; }

private:
    friend class AccessArbiter;
    enum class Stage { waiting, active, yielding };

    const void* owner_;
    const void* presenter_;
    const CancelFlag& cancel_;
    const std::thread::id thread_ = std::this_thread::get_id();
    std::vector<Path> paths_;
    Stage stage_ = Stage::waiting;
    /// Whom a yielding claim has asked and therefore lets write.
    std::vector<const void*> asked_;
    std::condition_variable changed_;
};

/// Grants claims: readers share, a writer is alone among what lies at, above and below its paths.
/// First come, first served, so that nobody starves; a claim of a thread (or coordinator) that
/// holds one already is nested and never waits for those who wait for it. Safe from any thread.
class AccessArbiter {
public:
    enum class Outcome {
        granted,
        cancelled,
        /// Two threads that hold claims each want what the other has; the later one gets this.
        wouldNeverEnd
    };

    static AccessArbiter& shared();

    Outcome acquire(AccessClaim& claim);
    void release(AccessClaim& claim);

    /// Lets readers in, and writers who ask for one of `presenters`, while the holder of the claim
    /// waits for those presenters. resume() takes exclusivity back, before all who wait.
    void yield(AccessClaim& claim, std::vector<const void*> presenters);
    Outcome resume(AccessClaim& claim);

    /// While its content is fetched, a claim holds nothing; only its path follows the item.
    void beginFetching(AccessClaim& claim);
    void endFetching(AccessClaim& claim);
    std::string pathWhileFetching(const AccessClaim& claim, std::size_t index);

    /// Lets claims look at their cancel flags again.
    void wake();
    /// Those that wait for the item, or for its content, go on waiting for its new place.
    void itemMoved(const std::string& from, const std::string& to);

private:
    using Claims = std::vector<AccessClaim*>;

    AccessArbiter() = default;
    Outcome await(AccessClaim& claim, std::unique_lock<std::mutex>& lock);
    void grantWaiting();
    bool canBeGranted(const AccessClaim& claim) const;
    bool blockedByActive(const AccessClaim& claim, bool byMetadataToo) const;
    bool blockedByWaiting(const AccessClaim& claim) const;
    bool isNested(const AccessClaim& claim) const;
    bool closesCircle(const AccessClaim& claim) const;
    bool waitsFor(const AccessClaim& claim, std::thread::id thread, Claims& seen) const;

    std::mutex mutex_;
    Claims active_;
    std::deque<AccessClaim*> waiting_;
    Claims fetching_;
};

} // namespace platform
