#include "platform/files/FileCoordinator.h"

#include "platform/files/AccessArbiter.h"
#include "platform/files/ContentProviderSlot.h"
#include "platform/files/DeletionInquiry.h"
#include "platform/files/ItemPaths.h"
#include "platform/files/LinkResolution.h"
#include "platform/files/PresenterRegistry.h"

#include <utility>

namespace platform {
namespace {

/// How often a document may turn into a promise again between its arrival and the read.
constexpr int fetchLimit = 8;

AccessKind accessKind(WritingOptions options) {
    const bool structural =
        options == WritingOptions::forDeleting || options == WritingOptions::forMoving;
    return structural ? AccessKind::structuralWrite : AccessKind::contentWrite;
}

Failure failureOf(AccessArbiter::Outcome outcome, const Url& item) {
    switch (outcome) {
    case AccessArbiter::Outcome::granted:
        return std::nullopt;
    case AccessArbiter::Outcome::cancelled:
        return makeError(ErrorCode::userCancelled);
    case AccessArbiter::Outcome::wouldNeverEnd:
        return makeError(ErrorCode::itemBusy, item.lastPathComponent());
    }
    return std::nullopt;
}

/// The URL as it was given, unless the item went elsewhere meanwhile.
Url urlAt(const std::string& path, const Url& given) {
    return path == standardPath(given) ? given : Url::file(path, given.hasDirectoryMark());
}

/// Releases a granted claim.
class Grant {
public:
    explicit Grant(AccessClaim& claim) : claim_(claim) {}
    ~Grant() { AccessArbiter::shared().release(claim_); }
    Grant(const Grant&) = delete;
    Grant& operator=(const Grant&) = delete;

private:
    AccessClaim& claim_;
};

} // namespace

/// One item of a write.
struct FileCoordinator::Target {
    Url item;
    WritingOptions options;
};

struct FileCoordinator::State {
    std::weak_ptr<FilePresenter> presenter;
    CancelFlag cancelled;
    std::mutex mutex;
    /// Under way, so that a cancellation can wake it. Guarded by mutex.
    std::shared_ptr<DeletionInquiry> inquiry;
    /// The innermost write whose accessor runs; used on the coordinating thread alone.
    WriteScope* scope = nullptr;

    Failure fetch(AccessClaim& claim, std::size_t index, const Url& item);
    Failure acquireContent(AccessClaim& claim, std::size_t index, const Url& item);
    Failure acquire(AccessClaim& claim, const Targets& targets);
    Failure askPresenters(AccessClaim& claim, const Url& item);
    Failure write(const Targets& targets, const std::function<void(const AccessClaim&)>& accessor);
};

FileCoordinator::FileCoordinator(std::weak_ptr<FilePresenter> presenter)
    : state_(std::make_shared<State>()) {
    state_->presenter = std::move(presenter);
}

FileCoordinator::~FileCoordinator() = default;

void FileCoordinator::cancel() {
    state_->cancelled.cancel();
    AccessArbiter::shared().wake();
    std::shared_ptr<DeletionInquiry> inquiry;
    {
        const std::lock_guard lock(state_->mutex);
        inquiry = state_->inquiry;
    }
    if (inquiry)
        inquiry->wake();
}

/// Makes an item's content local, following the item when it is moved meanwhile. Holds nothing.
Failure FileCoordinator::State::fetch(AccessClaim& claim, std::size_t index, const Url& item) {
    ContentProviderSlot& provider = ContentProviderSlot::shared();
    AccessArbiter& arbiter = AccessArbiter::shared();
    arbiter.beginFetching(claim);
    Failure failure;
    std::string path;
    do {
        path = arbiter.pathWhileFetching(claim, index);
        const Url url = urlAt(path, item);
        failure = provider.isPromised(url) ? provider.makeLocal(url, cancelled) : std::nullopt;
    } while (!cancelled.isCancelled() && path != arbiter.pathWhileFetching(claim, index));
    arbiter.endFetching(claim);
    return cancelled.isCancelled() ? makeError(ErrorCode::userCancelled) : failure;
}

/// Grants the claim with that item's content on the device.
Failure FileCoordinator::State::acquireContent(AccessClaim& claim, std::size_t index,
                                               const Url& item) {
    AccessArbiter& arbiter = AccessArbiter::shared();
    for (int i = 0; i < fetchLimit; ++i) {
        if (Failure failure = fetch(claim, index, item))
            return failure;
        if (Failure failure = failureOf(arbiter.acquire(claim), item))
            return failure;
        if (!ContentProviderSlot::shared().isPromised(urlAt(claim.path(index), item)))
            return std::nullopt;
        arbiter.release(claim); // it was evicted while the claim waited
    }
    return makeError(ErrorCode::itemBusy, item.lastPathComponent());
}

Failure FileCoordinator::coordinateReading(const Url& item, ReadingOptions options,
                                           const Accessor& accessor) {
    Url target = item;
    if (contains(options, ReadingOptions::resolvesSymbolicLink)) {
        Result<Url> resolved = resolvingSymbolicLinks(item);
        if (!resolved)
            return resolved.error();
        target = *std::move(resolved);
    }
    const bool metadata = contains(options, ReadingOptions::immediatelyAvailableMetadataOnly);
    AccessClaim claim(state_.get(), nullptr, state_->cancelled);
    claim.add(standardPath(target), metadata ? AccessKind::metadata : AccessKind::read);
    Failure failure = metadata ? failureOf(AccessArbiter::shared().acquire(claim), target)
                               : state_->acquireContent(claim, 0, target);
    if (failure)
        return failure;
    const Grant grant(claim);
    accessor(urlAt(claim.path(0), target));
    return std::nullopt;
}

Failure FileCoordinator::State::acquire(AccessClaim& claim, const Targets& targets) {
    for (std::size_t i = 0; i < targets.size(); ++i)
        if (targets[i].options == WritingOptions::none)
            return acquireContent(claim, i, targets[i].item);
    return failureOf(AccessArbiter::shared().acquire(claim), targets.front().item);
}

/// Asks those who present what is to be deleted, with the claim granted but readers let in.
Failure FileCoordinator::State::askPresenters(AccessClaim& claim, const Url& item) {
    const std::shared_ptr<FilePresenter> own = presenter.lock();
    std::vector<PresenterRecordPointer> concerned;
    std::vector<const void*> asked;
    for (auto& record : PresenterRegistry::shared().presentersMeeting(standardPath(item))) {
        if (record->key == own.get())
            continue;
        asked.push_back(record->key);
        concerned.push_back(std::move(record));
    }
    if (concerned.empty())
        return std::nullopt;
    AccessArbiter::shared().yield(claim, std::move(asked));
    const auto current = std::make_shared<DeletionInquiry>();
    {
        const std::lock_guard lock(mutex);
        inquiry = current;
    }
    Failure failure = current->ask(item, concerned, cancelled);
    {
        const std::lock_guard lock(mutex);
        inquiry.reset();
    }
    return failure ? failure : failureOf(AccessArbiter::shared().resume(claim), item);
}

Failure FileCoordinator::State::write(const Targets& targets,
                                      const std::function<void(const AccessClaim&)>& accessor) {
    const std::shared_ptr<FilePresenter> own = presenter.lock();
    AccessClaim claim(this, own.get(), cancelled);
    // Who makes a new item wants it there, wherever what was there before has gone.
    for (const Target& target : targets)
        claim.add(standardPath(target.item), accessKind(target.options),
                  target.options != WritingOptions::forReplacing);
    if (Failure failure = acquire(claim, targets))
        return failure;
    const Grant grant(claim);
    WriteScope current;
    current.own = own.get();
    for (std::size_t i = 0; i < targets.size(); ++i) {
        current.items.push_back({claim.path(i), targets[i].options});
        if (targets[i].options != WritingOptions::forDeleting)
            continue;
        if (Failure failure = askPresenters(claim, urlAt(claim.path(i), targets[i].item)))
            return failure;
    }
    WriteScope* const outer = std::exchange(scope, &current);
    PresenterRegistry::shared().beginWrite(current);
    accessor(claim);
    PresenterRegistry::shared().endWrite(current);
    scope = outer;
    return std::nullopt;
}

Failure FileCoordinator::coordinateWriting(const Url& item, WritingOptions options,
                                           const Accessor& accessor) {
    return state_->write({{item, options}},
                         [&](const AccessClaim& claim) { accessor(urlAt(claim.path(0), item)); });
}

Failure FileCoordinator::coordinateWriting(const Url& source, WritingOptions sourceOptions,
                                           const Url& destination,
                                           WritingOptions destinationOptions,
                                           const PairAccessor& accessor) {
    return state_->write({{source, sourceOptions}, {destination, destinationOptions}},
                         [&](const AccessClaim& claim) {
                             accessor(urlAt(claim.path(0), source),
                                      urlAt(claim.path(1), destination));
                         });
}

/// What the accessor does to the new place is its own doing as well.
void FileCoordinator::itemAtURLWillMoveToURL(const Url& /*from*/, const Url& to) {
    if (state_->scope)
        PresenterRegistry::shared().noteAnnounced(*state_->scope, standardPath(to));
}

void FileCoordinator::itemAtURLDidMoveToURL(const Url& from, const Url& to) {
    const std::string source = standardPath(from);
    const std::string target = standardPath(to);
    AccessArbiter::shared().itemMoved(source, target);
    PresenterRegistry& registry = PresenterRegistry::shared();
    if (state_->scope) {
        registry.noteMove(*state_->scope, source, target);
        return;
    }
    // Outside an accessor: somebody moved the item without having asked. The notices go out at
    // once.
    const std::shared_ptr<FilePresenter> own = state_->presenter.lock();
    WriteScope moved;
    moved.own = own.get();
    moved.moves.emplace_back(source, target);
    registry.beginWrite(moved);
    registry.endWrite(moved);
}

void FileCoordinator::addFilePresenter(const std::shared_ptr<FilePresenter>& presenter) {
    PresenterRegistry::shared().add(presenter);
}

void FileCoordinator::removeFilePresenter(const std::shared_ptr<FilePresenter>& presenter) {
    PresenterRegistry::shared().remove(presenter.get());
}

void FileCoordinator::removeFilePresenter(const FilePresenter* presenter) {
    PresenterRegistry::shared().remove(presenter);
}

void FileCoordinator::waitUntilIdle() {
    PresenterRegistry::shared().waitUntilIdle();
}

void FileCoordinator::setContentProvider(ContentProvider* provider) {
    ContentProviderSlot::shared().set(provider);
}

ContentProvider* FileCoordinator::contentProvider() {
    return ContentProviderSlot::shared().get();
}

} // namespace platform
