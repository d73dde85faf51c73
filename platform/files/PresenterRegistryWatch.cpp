// What other programs do to presented items. The kernel's notices only say where to look: every
// decision rests on comparing what is there with what the presenter knows, so that a change is told
// once, whoever reports it, and a lost notice is made up for by the next one. Where the kernel's
// file times are coarse, a second change of the same size within one tick of the clock goes unseen.
#include "platform/files/FilesClock.h"
#include "platform/files/ItemPaths.h"
#include "platform/files/PresenterRegistry.h"

#include <algorithm>
#include <utility>

namespace platform {
namespace {

/// Programs save by moving the old file away and a new one in its place: only an item that stays
/// away longer was moved or deleted.
constexpr Duration returnTime = std::chrono::milliseconds(250);

void tellChange(const PresenterRecordPointer& record) {
    PresenterRegistry::post(record,
                            [](FilePresenter& presenter) { presenter.presentedItemDidChange(); });
}

using Kind = DirectoryChange::Kind;

/// Whether the entry went, and not just to another name of the same folder.
bool leftFolder(const DirectoryChange& change, const std::vector<DirectoryChange>& changes) {
    if (change.kind == Kind::removed)
        return true;
    return change.kind == Kind::movedFrom &&
           std::none_of(changes.begin(), changes.end(), [&](const DirectoryChange& other) {
               return other.kind == Kind::movedTo && other.cookie == change.cookie;
           });
}

/// The same item to its presenter. What happens to a folder's entries is told apart from that: it
/// leaves the folder with equal times of modification and change.
bool sameItem(const PresentedItemState& now, const PresentedItemState& known) {
    if (!now.isFolder() || !known.isFolder())
        return now == known;
    const FileAttributes& folder = now.attributes;
    return folder.identity == known.attributes.identity &&
           (folder.changed == folder.modified || folder.changed == known.attributes.changed);
}

} // namespace

/// Called with the lock held.
bool PresenterRegistry::beingWritten(std::string_view path) const {
    return std::any_of(scopes_.begin(), scopes_.end(),
                       [&](const WriteScope* scope) { return scope->meets(path); });
}

void PresenterRegistry::examineLater(const PresenterRecordPointer& record) {
    queue_.async([this, weak = std::weak_ptr(record)] {
        if (const auto alive = weak.lock())
            examine(alive);
    });
}

void PresenterRegistry::examine(const PresenterRecordPointer& record) {
    if (!askForUrl(record))
        return;
    std::unique_lock lock(mutex_);
    const std::string path = record->path;
    const std::uint64_t version = record->version;
    lock.unlock();
    const PresentedItemState now = PresentedItemState::read(path);
    lock.lock();
    if (record->version != version) {
        lock.unlock();
        examineLater(record);
        return;
    }
    // Whoever writes just now looks at the item when he has finished.
    if (beingWritten(path))
        return;
    const bool same = sameItem(now, record->state);
    if (now.presence == PresentedItemState::Presence::absent) {
        lock.unlock();
        if (!same)
            itemMissing(record, version);
        return;
    }
    record->missingSince.reset();
    if (same)
        return;
    store(*record, now);
    lock.unlock();
    tellChange(record);
}

void PresenterRegistry::itemMissing(const PresenterRecordPointer& record, std::uint64_t version) {
    Clock& clock = filesClock();
    {
        const std::lock_guard lock(mutex_);
        const Duration now = clock.monotonic();
        const bool first = !record->missingSince;
        if (first)
            record->missingSince = now;
        if (!first && now - *record->missingSince < returnTime)
            return; // the alarm that was set then is still to come
        if (first) {
            clock.setAlarm(returnTime, [this, weak = std::weak_ptr(record)] {
                if (const auto alive = weak.lock())
                    examineLater(alive);
            });
            return;
        }
    }
    itemGone(record, version);
}

/// The item stayed away: finds out where it went.
void PresenterRegistry::itemGone(const PresenterRecordPointer& record, std::uint64_t version) {
    std::optional<std::string> target;
    {
        const std::lock_guard lock(mutex_);
        if (record->version != version)
            return;
        target = record->handle.currentPath();
        if (!target)
            store(*record, {});
    }
    if (!target) {
        post(record, [](FilePresenter& presenter) {
            presenter.accommodatePresentedItemDeletionWithCompletionHandler([](const Failure&) {});
        });
        return;
    }
    setPath(record, *target);
    post(record, [url = Url::file(*target)](FilePresenter& presenter) {
        presenter.presentedItemDidMoveToURL(url);
    });
}

/// Called with the lock held: for a presented folder, its direct entries.
void PresenterRegistry::watchEntries(PresenterRecord& record) {
    record.entriesWatch = watcher_.watch(
        Url::file(record.path), queue_,
        [this, weak = record.weak_from_this()](const std::vector<DirectoryChange>& changes) {
            if (const auto alive = weak.lock())
                entriesChanged(alive, changes);
        });
}

/// Called with the lock held, when a write has ended.
void PresenterRegistry::takeUpPostponed() {
    for (const PresenterRecordPointer& record : records_)
        if (!record->postponed.empty() && !beingWritten(record->path))
            queue_.async([this, weak = std::weak_ptr(record),
                          changes = std::exchange(record->postponed, {})] {
                if (const auto alive = weak.lock())
                    entriesChanged(alive, changes);
            });
}

/// The entry's state when it is another one than the presenter knows of; it is known from then on.
/// None also when a write of the folder has begun; the change is looked into after it.
std::optional<PresentedItemState> PresenterRegistry::newEntryState(PresenterRecord& record,
                                                                   const std::string& folder,
                                                                   const DirectoryChange& change) {
    const std::string path = folder + '/' + change.name;
    std::unique_lock lock(mutex_);
    for (;;) {
        const std::uint64_t version = record.entriesVersion;
        lock.unlock();
        const PresentedItemState now = PresentedItemState::read(path);
        lock.lock();
        if (record.path != folder)
            return std::nullopt;
        if (beingWritten(folder)) {
            record.postponed.push_back(change);
            return std::nullopt;
        }
        // A write that began and ended since the look knows better.
        if (version == record.entriesVersion)
            return noteEntry(record, change.name, now) ? std::optional(now) : std::nullopt;
    }
}

void PresenterRegistry::entriesChanged(const PresenterRecordPointer& record,
                                       const std::vector<DirectoryChange>& changes) {
    const std::string folder = pathOf(*record);
    if (!PresentedItemState::read(folder).isFolder())
        return; // the folder went with its entries, which examine() tells
    {
        const std::lock_guard lock(mutex_);
        if (record->path != folder)
            return;
        if (beingWritten(folder)) {
            record->postponed.insert(record->postponed.end(), changes.begin(), changes.end());
            return;
        }
    }
    bool told = false; // one notice a batch that the folder changed
    for (const DirectoryChange& change : changes) {
        // A folder that is gone is found by examine().
        const bool overflow = change.kind == Kind::overflow;
        if (change.name.empty() && !overflow)
            continue;
        const Url entry = Url::file(folder + '/' + change.name, change.isDirectory);
        const auto now = overflow ? PresentedItemState::read(folder)
                                  : newEntryState(*record, folder, change);
        if (!now)
            continue;
        const bool absent = now->presence == PresentedItemState::Presence::absent;
        if (absent && leftFolder(change, changes) && !change.name.starts_with('.'))
            post(record, [entry](FilePresenter& presenter) {
                presenter.accommodatePresentedSubitemDeletionAtURL(entry, [](const Failure&) {});
            });
        else if (!std::exchange(told, true))
            tellChange(record);
    }
}

} // namespace platform
