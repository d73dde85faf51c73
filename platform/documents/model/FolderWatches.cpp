#include "platform/documents/model/FolderWatches.h"

#include "platform/base/MainQueue.h"
#include "platform/files/DirectoryWatcher.h"
#include "platform/files/FileManager.h"

#include <algorithm>
#include <mutex>
#include <unordered_map>
#include <utility>

namespace platform {
namespace {

/// A folder that is being filled is not counted for every item.
constexpr Duration pause = std::chrono::milliseconds(500);

using Changes = std::vector<DirectoryChange>;

bool tells(const Changes& changes, DirectoryChange::Kind kind) {
    return std::any_of(changes.begin(), changes.end(),
                       [kind](const DirectoryChange& each) { return each.kind == kind; });
}

bool mayChangeCount(const Changes& changes) {
    return !std::all_of(changes.begin(), changes.end(), [](const DirectoryChange& each) {
        return each.kind == DirectoryChange::Kind::modified ||
               each.kind == DirectoryChange::Kind::attributes;
    });
}

/// Asked first, since a watch that fails is logged.
bool canBeRead(const Url& folder) {
    return !FileManager::enumerate(folder.path(), [](const DirectoryEntry&) { return false; });
}

} // namespace

struct FolderWatches::State : std::enable_shared_from_this<FolderWatches::State> {
    State(DirectoryWatcher& theWatcher, MainQueue& theMain, Changed theReceiver)
        : watcher(theWatcher), main(theMain), receiver(std::move(theReceiver)) {}

    void take(RowId row, const Changes& changes) {
        // Another folder may stand under the name by now: it is followed when it is counted.
        if (tells(changes, DirectoryChange::Kind::folderGone))
            forget(row);
        if (!mayChangeCount(changes))
            return;
        changed.insert(row);
        if (!resting)
            tell();
    }

    void tell() {
        resting = main.timer(pause, [this] {
            if (!changed.empty())
                tell();
        });
        const std::unordered_set<RowId> rows = std::exchange(changed, {});
        receiver({rows.begin(), rows.end()});
    }

    void forget(RowId row) {
        DirectoryWatcher::Token ended; // outlives the lock
        const std::lock_guard lock(mutex);
        if (const auto found = watches.find(row); found != watches.end()) {
            ended = std::move(found->second);
            watches.erase(found);
        }
    }

    /// False when the row has a watch already.
    bool reserve(RowId row) {
        const std::lock_guard lock(mutex);
        return watches.try_emplace(row).second;
    }

    void keep(RowId row, DirectoryWatcher::Token watch) {
        // What is not kept ends after the lock.
        const std::lock_guard lock(mutex);
        const auto place = watches.find(row);
        if (place == watches.end())
            return;
        if (watch)
            place->second.swap(watch);
        else
            watches.erase(place);
    }

    DirectoryWatcher& watcher;
    MainQueue& main;
    const Changed receiver;
    std::unordered_set<RowId> changed;
    Timer resting;
    std::mutex mutex;
    /// Guarded by mutex. Empty while a watch is being made.
    std::unordered_map<RowId, DirectoryWatcher::Token> watches;
};

FolderWatches::FolderWatches(DirectoryWatcher& watcher, MainQueue& main, Changed changed)
    : state_(std::make_shared<State>(watcher, main, std::move(changed))) {
}

FolderWatches::~FolderWatches() {
    keepOnly({});
}

void FolderWatches::follow(RowId row, const Url& folder) {
    if (!canBeRead(folder) || !state_->reserve(row))
        return;
    // The disk may be slow: nobody waits for it meanwhile.
    DirectoryWatcher::Token watch = state_->watcher.watch(
        folder, state_->main, [weak = std::weak_ptr(state_), row](const Changes& changes) {
            if (const auto state = weak.lock())
                state->take(row, changes);
        });
    state_->keep(row, std::move(watch));
}

std::vector<RowId> FolderWatches::keepOnly(const std::unordered_set<RowId>& rows) {
    std::vector<RowId> left;
    std::vector<DirectoryWatcher::Token> ended; // outlive the lock
    const std::lock_guard lock(state_->mutex);
    std::erase_if(state_->watches, [&](auto& watch) {
        if (rows.contains(watch.first))
            return false;
        left.push_back(watch.first);
        ended.push_back(std::move(watch.second));
        return true;
    });
    return left;
}

} // namespace platform
