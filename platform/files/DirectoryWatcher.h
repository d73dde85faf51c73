#pragma once

#include "platform/base/Executor.h"
#include "platform/base/Url.h"

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace platform {

/// One thing that happened in a watched folder. Two of a rename share their cookie.
struct DirectoryChange {
    enum class Kind {
        created,
        removed,
        modified,
        attributes,
        movedFrom,
        movedTo,
        folderGone,
        overflow
    };
    Kind kind = Kind::modified;
    std::string name;
    bool isDirectory = false;
    std::uint32_t cookie = 0;
};

/// Watches the direct entries of folders by the kernel's notices. Reports arrive in batches on the
/// given queue. An `overflow` means that notices were lost and the folder must be read again; where
/// the machine has no watch left for a folder, it comes every half minute. After `folderGone` (the
/// folder itself was removed, moved or unmounted) nothing more comes. Repeated changes of one entry
/// may arrive as one. A change somewhere above the folder is not noticed. Safe from any thread.
class DirectoryWatcher {
public:
    using Handler = std::function<void(const std::vector<DirectoryChange>& changes)>;
    using Token = std::shared_ptr<void>;

    DirectoryWatcher();
    ~DirectoryWatcher();
    DirectoryWatcher(const DirectoryWatcher&) = delete;
    DirectoryWatcher& operator=(const DirectoryWatcher&) = delete;

    /// Watched until the token or the watcher is dropped; empty when the folder cannot be watched
    /// (logged). No handler starts after that; the queue must live until then.
    [[nodiscard]] Token watch(const Url& folder, Executor& queue, Handler handler);

private:
    struct State;
    std::shared_ptr<State> state_;
};

} // namespace platform
