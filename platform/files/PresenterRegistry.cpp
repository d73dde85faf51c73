#include "platform/files/PresenterRegistry.h"

#include "platform/base/OperationQueue.h"
#include "platform/files/ItemPaths.h"
#include "platform/files/PathText.h"

#include <algorithm>
#include <set>

namespace platform {
namespace {

/// How many entries of a presented folder are remembered; beyond that a change may be told twice.
constexpr std::size_t entryLimit = 4096;

} // namespace

bool WriteScope::meets(std::string_view path) const {
    return std::any_of(items.begin(), items.end(),
                       [&](const Item& item) { return pathsMeet(item.path, path); }) ||
           std::any_of(moves.begin(), moves.end(),
                       [&](const auto& move) {
                           return pathsMeet(move.first, path) || pathsMeet(move.second, path);
                       }) ||
           std::any_of(announced.begin(), announced.end(),
                       [&](const std::string& one) { return pathsMeet(one, path); });
}

bool WriteScope::has(WritingOptions options) const {
    return std::any_of(items.begin(), items.end(),
                       [&](const Item& item) { return item.options == options; });
}

PresenterRegistry& PresenterRegistry::shared() {
    static PresenterRegistry* const registry = new PresenterRegistry(); // never goes
    return *registry;
}

void PresenterRegistry::add(const std::shared_ptr<FilePresenter>& presenter) {
    if (!presenter)
        return;
    const auto record = std::make_shared<PresenterRecord>(presenter);
    // Watched and read before it is listed: a write in between is found by the watch.
    askForUrl(record);
    const std::lock_guard lock(mutex_);
    const bool listed = std::any_of(records_.begin(), records_.end(), [&](const auto& one) {
        return one->key == record->key && !one->presenter.expired();
    });
    if (!listed)
        records_.push_back(record);
}

void PresenterRegistry::remove(const FilePresenter* presenter) {
    std::vector<PresenterRecordPointer> removed; // released without the lock
    const std::lock_guard lock(mutex_);
    const auto rest = std::stable_partition(records_.begin(), records_.end(),
                                            [&](const auto& one) { return one->key != presenter; });
    removed.assign(rest, records_.end());
    records_.erase(rest, records_.end());
    for (const auto& record : removed)
        record->registered = false;
}

std::vector<PresenterRecordPointer> PresenterRegistry::all() {
    std::vector<PresenterRecordPointer> gone; // released without the lock
    const std::lock_guard lock(mutex_);
    const auto rest = std::stable_partition(records_.begin(), records_.end(), [](const auto& one) {
        return !one->presenter.expired();
    });
    gone.assign(rest, records_.end());
    records_.erase(rest, records_.end());
    return records_;
}

std::vector<PresenterRecordPointer> PresenterRegistry::presentersMeeting(std::string_view path) {
    std::vector<PresenterRecordPointer> found;
    for (const PresenterRecordPointer& record : all())
        if (askForUrl(record) && pathsMeet(pathOf(*record), path))
            found.push_back(record);
    return found;
}

std::string PresenterRegistry::pathOf(const PresenterRecord& record) {
    const std::lock_guard lock(mutex_);
    return record.path;
}

bool PresenterRegistry::askForUrl(const PresenterRecordPointer& record) {
    const std::shared_ptr<FilePresenter> presenter = record->presenter.lock();
    if (!presenter || !record->registered)
        return false;
    const std::optional<Url> url = presenter->presentedItemURL();
    const std::string answer = url && url->isFile() ? standardPath(*url) : std::string();
    {
        const std::lock_guard lock(mutex_);
        // The same answer as before is not asked to overrule a move that the presenter has not
        // taken in yet.
        if (record->answer == answer)
            return !record->path.empty();
        record->answer = answer;
        if (record->path == answer)
            return !answer.empty();
    }
    setPath(record, answer);
    return !answer.empty();
}

/// Lets the record follow its item to `path`, and reads what is there.
void PresenterRegistry::setPath(const PresenterRecordPointer& record, const std::string& path) {
    std::unique_ptr<ItemWatch> watch;
    if (!path.empty())
        watch = std::make_unique<ItemWatch>(watcher_, path, ItemWatch::Scope::wholeFolder, queue_,
                                            [this, weak = std::weak_ptr(record)] {
                                                if (const auto alive = weak.lock())
                                                    examine(alive);
                                            });
    DirectoryWatcher::Token entriesWatch;
    {
        const std::lock_guard lock(mutex_);
        record->path = path;
        record->state = {};
        record->handle = {};
        record->entries.clear();
        record->postponed.clear();
        record->missingSince.reset();
        ++record->version;
        watch.swap(record->watch);
        entriesWatch.swap(record->entriesWatch);
    }
    if (refresh(*record, false).isFolder())
        noteAllEntries(*record, path);
}

/// Reads the item's state anew and keeps it. A missing item is kept as such only with
/// `keepMissing`; else it has still to be found out where it went.
PresentedItemState PresenterRegistry::refresh(PresenterRecord& record, bool keepMissing) {
    for (;;) {
        std::string path;
        std::uint64_t version = 0;
        {
            const std::lock_guard lock(mutex_);
            path = record.path;
            version = record.version;
        }
        if (path.empty())
            return {};
        const PresentedItemState state = PresentedItemState::read(path);
        const std::lock_guard lock(mutex_);
        if (version != record.version)
            continue;
        if (state.presence != PresentedItemState::Presence::absent || keepMissing)
            store(record, state);
        return state;
    }
}

/// Called with the lock held.
void PresenterRegistry::store(PresenterRecord& record, const PresentedItemState& state) {
    const bool same = record.state.presence == state.presence &&
                      record.state.attributes.identity == state.attributes.identity;
    record.state = state;
    ++record.version;
    record.missingSince.reset();
    if (!same)
        record.handle = state.presence == PresentedItemState::Presence::present
                            ? ItemHandle(record.path)
                            : ItemHandle();
    if (state.isFolder() && !same)
        watchEntries(record);
}

void PresenterRegistry::post(const PresenterRecordPointer& record, Notice notice) {
    const std::shared_ptr<FilePresenter> presenter = record->presenter.lock();
    if (!presenter || !record->registered)
        return;
    const std::shared_ptr<Executor> queue = presenter->presentedItemOperationQueue();
    Executor& place = queue ? *queue : OperationQueue::global();
    place.async([record, notice = std::move(notice)] {
        const std::shared_ptr<FilePresenter> alive = record->presenter.lock();
        if (alive && record->registered)
            notice(*alive);
    });
}

void PresenterRegistry::beginWrite(const WriteScope& scope) {
    const std::lock_guard lock(mutex_);
    scopes_.push_back(&scope);
}

void PresenterRegistry::noteAnnounced(WriteScope& scope, const std::string& path) {
    const std::lock_guard lock(mutex_);
    scope.announced.push_back(path);
}

void PresenterRegistry::noteMove(WriteScope& scope, const std::string& from,
                                 const std::string& to) {
    const std::lock_guard lock(mutex_);
    scope.moves.emplace_back(from, to);
}

void PresenterRegistry::endWrite(const WriteScope& scope) {
    for (const PresenterRecordPointer& record : all())
        if (askForUrl(record) && scope.meets(pathOf(*record)))
            finishWrite(scope, record);
    const std::lock_guard lock(mutex_);
    std::erase(scopes_, &scope);
    takeUpPostponed();
}

void PresenterRegistry::finishWrite(const WriteScope& scope, const PresenterRecordPointer& record) {
    const std::string path = pathOf(*record);
    std::string target = path;
    for (const auto& [from, to] : scope.moves)
        target = movedPath(target, from, to);
    const bool tell = record->key != scope.own;
    if (target != path) {
        setPath(record, target);
        if (tell)
            post(record, [url = Url::file(target)](FilePresenter& presenter) {
                presenter.presentedItemDidMoveToURL(url);
            });
    } else if (changedByWrite(scope, record, path) && tell) {
        post(record, [](FilePresenter& presenter) { presenter.presentedItemDidChange(); });
    }
}

/// Whether the presenter has something to hear, other than a move. Keeps the item's new state.
bool PresenterRegistry::changedByWrite(const WriteScope& scope,
                                       const PresenterRecordPointer& record,
                                       const std::string& path) {
    PresentedItemState before;
    {
        const std::lock_guard lock(mutex_);
        before = record->state;
    }
    const auto at = [&](WritingOptions options) {
        return std::any_of(scope.items.begin(), scope.items.end(), [&](const auto& item) {
            return item.options == options && isAtOrBelow(path, item.path);
        });
    };
    // A deletion was announced before it happened. Any other way of vanishing is looked into.
    const bool deleted = at(WritingOptions::forDeleting);
    const PresentedItemState now = refresh(*record, deleted);
    if (now.isFolder())
        noteEntries(*record, scope, path);
    if (now.presence == PresentedItemState::Presence::absent) {
        if (!deleted)
            examineLater(record);
        return false;
    }
    if (scope.has(WritingOptions::forDeleting))
        return deleted && now != before;
    // A failed move changes nothing; whoever writes content is believed to have written some.
    if (now != before || !scope.moves.empty())
        return true;
    return !scope.has(WritingOptions::forMoving) &&
           std::any_of(scope.items.begin(), scope.items.end(),
                       [&](const auto& item) { return isAtOrBelow(item.path, path); });
}

/// The presenter of a folder is told of the write as a whole: what it did to the folder's direct
/// entries is known from then on.
void PresenterRegistry::noteEntries(PresenterRecord& record, const WriteScope& scope,
                                    const std::string& folder) {
    const auto noteOne = [&](const std::string& path) {
        if (folderOf(path) != folder)
            return;
        const PresentedItemState now = PresentedItemState::read(path);
        const std::lock_guard lock(mutex_);
        noteEntry(record, std::string(nameOf(path)), now);
    };
    for (const auto& [from, to] : scope.moves) {
        noteOne(from);
        noteOne(to);
    }
    for (const WriteScope::Item& item : scope.items) {
        if (isAtOrBelow(folder, item.path))
            noteAllEntries(record, folder);
        noteOne(item.path);
    }
}

void PresenterRegistry::noteAllEntries(PresenterRecord& record, const std::string& folder) {
    std::set<std::string> names;
    (void)FileManager::enumerate(folder, [&names](const DirectoryEntry& entry) {
        names.insert(entry.name);
        return names.size() < entryLimit;
    });
    {
        const std::lock_guard lock(mutex_); // those that are gone by now
        for (const auto& known : record.entries)
            names.insert(known.first);
    }
    for (const std::string& name : names) {
        const PresentedItemState now = PresentedItemState::read(folder + '/' + name);
        const std::lock_guard lock(mutex_);
        noteEntry(record, name, now);
    }
}

/// Called with the lock held: remembers the entry's state. Answers whether it is another one than
/// the presenter knows of. A hidden file that came and went unseen served somebody's saving.
bool PresenterRegistry::noteEntry(PresenterRecord& record, const std::string& name,
                                  const PresentedItemState& now) {
    const auto known = record.entries.find(name);
    if (known == record.entries.end()) {
        if (now.presence == PresentedItemState::Presence::absent && name.starts_with('.'))
            return false;
    } else if (known->second == now) {
        return false;
    }
    record.entries.insert_or_assign(name, now);
    ++record.entriesVersion;
    if (record.entries.size() > entryLimit)
        record.entries.clear();
    return true;
}

} // namespace platform
