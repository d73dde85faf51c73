#pragma once

#include "platform/base/Url.h"
#include "platform/cloud/ContainerSet.h"
#include "platform/cloud/StateDatabase.h"

#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>

namespace platform {

struct FileIdentityHash {
    std::size_t operator()(const FileIdentity& identity) const noexcept {
        const std::size_t mixed = identity.inode * 0x9E3779B97F4A7C15ULL;
        return mixed ^ (identity.device << 1) ^ static_cast<std::size_t>(identity.birthNanoseconds);
    }
};
/// Roles of shared items that have something on the disk, by what they are there: a move by any
/// program leaves them right.
using SharedRoles = std::unordered_map<FileIdentity, SharedRole, FileIdentityHash>;

/// What reads need of a store: immutable, replaced as a whole, so that no read takes a lock or asks
/// a queue.
struct StoreView {
    /// Path of Shelfroot, and the same without symbolic links in it.
    std::string root;
    std::string canonicalRoot;
    /// What the store's promises are marked with.
    std::string mark;
    std::shared_ptr<const ContainerSet> containers;
    std::shared_ptr<const SharedRoles> roles;
    /// None while there is no database.
    std::shared_ptr<StateReader> reader;

    /// The path relative to Shelfroot; none outside it. The answer points into `path`.
    std::optional<std::string_view> relative(std::string_view path) const;
};

/// Where the current view hangs; empty without a store. The mutex is held for the copy of one
/// pointer, which is what the library's atomic pointer does as well.
class StoreViewSlot {
public:
    std::shared_ptr<const StoreView> load() const {
        const std::lock_guard lock(mutex_);
        return view_;
    }
    void store(std::shared_ptr<const StoreView> view) {
        const std::lock_guard lock(mutex_);
        view_.swap(view); // the former one is let go after the lock
    }

private:
    mutable std::mutex mutex_;
    std::shared_ptr<const StoreView> view_; // guarded by mutex_
};

} // namespace platform
