#pragma once

#include "platform/cloud/StoreContext.h"

namespace platform {

/// Deletions by the user, on the store's queue: contents go to the kept folder, promises go, and
/// the record says that the item is not on the disk any more: what the remote still has of it is
/// then to be deleted there.
class StoreRemovals {
public:
    explicit StoreRemovals(StoreContext& context) : context_(context) {}

    /// A document, a promise, or a folder with all in it. `relative` is its path in the store.
    [[nodiscard]] Failure remove(const std::string& relative);

    /// The default library, the store's root and its mark: what the store itself needs.
    static bool isFixed(std::string_view relative);

private:
    /// Anything in it that the remote is not known to have.
    bool holdsUnsent(const std::string& relative, const FileAttributes& attributes);
    bool isUnsent(ItemId folder, const std::string& path);

    StoreContext& context_;
};

} // namespace platform
