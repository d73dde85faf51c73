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
/// given queue; an overflow, or a watch limit that is reached, is reported as `overflow` and means
/// that the folder must be read again. Safe from any thread.
class DirectoryWatcher {
public:
    using Handler = std::function<void(const std::vector<DirectoryChange>& changes)>;
    using Token = std::shared_ptr<void>;

    DirectoryWatcher();
    ~DirectoryWatcher();
    DirectoryWatcher(const DirectoryWatcher&) = delete;
    DirectoryWatcher& operator=(const DirectoryWatcher&) = delete;

    /// Watched until the token is dropped; empty when the folder cannot be watched (logged).
    [[nodiscard]] Token watch(const Url& folder, Executor& queue, Handler handler);

private:
    struct State;
    std::shared_ptr<State> state_;
};

} // namespace platform
