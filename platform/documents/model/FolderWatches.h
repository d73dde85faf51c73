#pragma once

#include "platform/documents/model/DocumentEntry.h"

#include <functional>
#include <memory>
#include <unordered_set>
#include <vector>

namespace platform {

class DirectoryWatcher;
class MainQueue;

/// Tells of the folders among the rows in view that something went into or out of them: the folder
/// that they stand in gives no notice of that. Belongs to the main thread, but for `follow`.
class FolderWatches {
public:
    /// Called on the main queue, at most twice a second, not any more once the watches are gone.
    using Changed = std::function<void(const std::vector<RowId>& rows)>;

    FolderWatches(DirectoryWatcher& watcher, MainQueue& main, Changed changed);
    ~FolderWatches();
    FolderWatches(const FolderWatches&) = delete;
    FolderWatches& operator=(const FolderWatches&) = delete;

    /// What happens in the row's folder from now on is told. Safe from any thread; blocks for a
    /// look at the disk.
    void follow(RowId row, const Url& folder);
    /// Ends all others, and answers their rows.
    std::vector<RowId> keepOnly(const std::unordered_set<RowId>& rows);

private:
    struct State;
    std::shared_ptr<State> state_;
};

} // namespace platform
