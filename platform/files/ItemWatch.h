#pragma once

#include "platform/files/DirectoryWatcher.h"

#include <memory>

namespace platform {

/// Hears when something may have happened to one path, also when the folders on the way to it are
/// removed, moved or made only later. It does not say what: whoever hears looks for himself.
class ItemWatch {
public:
    /// Which entries of the item's own folder matter.
    enum class Scope { item, wholeFolder };

    /// `touched` runs on `queue`, until the object goes away. The watcher and the queue outlive it.
    ItemWatch(DirectoryWatcher& watcher, std::string_view path, Scope scope, Executor& queue,
              Job touched);
    ~ItemWatch();
    ItemWatch(const ItemWatch&) = delete;
    ItemWatch& operator=(const ItemWatch&) = delete;

private:
    struct State;
    std::shared_ptr<State> state_;
};

} // namespace platform
