#pragma once

#include <mutex>
#include <set>
#include <string>
#include <utility>

namespace platform {

/// What of the disk is to be looked at: folders in which something happened since somebody last
/// looked, or the whole tree. Paths are relative to the store's root. Safe from any thread.
class DirtyFolders {
public:
    struct Marks {
        bool everything = false;
        std::set<std::string> folders;
        bool empty() const { return !everything && folders.empty(); }
    };

    void add(const std::string& folder) {
        const std::lock_guard lock(mutex_);
        marks_.folders.insert(folder);
    }
    /// Once more, after a look that came to nothing.
    void add(const Marks& marks) {
        const std::lock_guard lock(mutex_);
        marks_.everything = marks_.everything || marks.everything;
        marks_.folders.insert(marks.folders.begin(), marks.folders.end());
    }
    /// What is marked from now on is for a later look.
    Marks take() {
        const std::lock_guard lock(mutex_);
        return std::exchange(marks_, {});
    }

private:
    std::mutex mutex_;
    Marks marks_;
};

} // namespace platform
