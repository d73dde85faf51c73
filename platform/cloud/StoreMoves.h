#pragma once

#include "platform/cloud/StoreContext.h"

#include <optional>
#include <string>
#include <vector>

namespace platform {

/// The move that works for documents, promises and folders alike: the disk first, then the record.
/// A promise moves by its sidecar, which holds the item's identity, and everything else is known
/// again by its own, so that a stop between the two loses nothing.
class StoreMoves {
public:
    /// What was moved on the disk.
    struct Moved {
        Url from;
        Url to;
        /// Of the promise as it stands now; none for what is on the device.
        std::optional<FoundSidecar> promise = {};
        /// None where there is nothing to record.
        std::optional<FileAttributes> attributes = {};
    };

    explicit StoreMoves(StoreContext& context) : context_(context) {}

    /// Both, on the store's queue; puts back on the disk what cannot be recorded. Never replaces:
    /// fileExists when something stands, or is promised, at `to`. One of the two may lie outside
    /// the store, but what is only promised cannot leave it (unsupportedOperation).
    [[nodiscard]] Failure move(const Url& from, const Url& to);
    /// The disk alone, on any thread.
    [[nodiscard]] Result<Moved> moveOnDisk(const Url& from, const Url& to);
    /// The records of moves, in their order, on the store's queue: all of them, or none.
    [[nodiscard]] Failure record(const std::vector<Moved>& moves);
    /// Gives the promise's own file the place of the promise of `name` in `folder`; nothing is
    /// recorded.
    Result<FoundSidecar> renameSidecar(const FoundSidecar& promise, const std::string& folder,
                                       const std::string& name);

private:
    std::optional<std::string> relative(const Url& url) const;
    Result<Moved> movePresent(const Url& from, const Url& to, bool directory);
    Result<Moved> movePromise(const Url& from, const Url& to, const FoundSidecar& promise);
    Failure putBack(const Moved& moved);
    Failure recordOne(const Moved& moved);
    /// The item of a folder of the disk, made where the store did not know it yet.
    Result<ItemId> folderItem(const std::string& relative);

    StoreContext& context_;
};

} // namespace platform
