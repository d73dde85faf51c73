#pragma once

#include "platform/base/Error.h"
#include "platform/documents/model/EntrySource.h"

#include <functional>
#include <memory>
#include <vector>

namespace platform {

class MainQueue;

/// Keeps a list in step with its folder: reads it on a queue of its own, follows it by the watcher,
/// and looks out for it while it is gone. Belongs to the main thread.
class FolderFeed {
public:
    /// All called on the main queue, and not any more once the feed is gone.
    struct Receiver {
        /// A whole reading, sorted. `replaced`: another folder stands in the place of the one that
        /// was read before.
        std::function<void(std::vector<DocumentEntry> sorted, bool replaced)> read;
        /// One after the other, as many as there were since the last call.
        std::function<void(const std::vector<EntryChanges>& changes)> changed;
        /// The folder is gone or cannot be read.
        std::function<void(const Error& error)> failed;
    };

    FolderFeed(std::unique_ptr<EntrySource> source, MainQueue& main, DirectoryWatcher& watcher,
               Receiver receiver);
    /// Waits for the step of a reading that is under way.
    ~FolderFeed();
    FolderFeed(const FolderFeed&) = delete;
    FolderFeed& operator=(const FolderFeed&) = delete;

    /// Reads the folder (again). `done` is called on the main queue after the answer.
    void read(std::function<void()> done = {});
    /// Reads again only when the folder is not the one any more that was read: a rename above it
    /// gives no notice.
    void verify();

private:
    struct State;
    std::shared_ptr<State> state_;
};

} // namespace platform
