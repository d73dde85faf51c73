#pragma once

#include "platform/cloud/StoreContext.h"

#include <functional>

namespace platform {

/// The move that works for documents, promises and folders alike, on the store's queue: the disk
/// first, then the record. A promise moves by its sidecar, which holds the item's identity, so that
/// a stop between the two loses nothing.
class StoreMoves {
public:
    explicit StoreMoves(StoreContext& context) : context_(context) {}

    /// Never replaces: fileExists when something stands, or is promised, at `to`. One of the two
    /// may lie outside the store, but what is only promised cannot leave it (unsupportedOperation).
    [[nodiscard]] Failure move(const Url& from, const Url& to);
    /// Gives the promise's own file the place of the promise of `name` in `folder`; nothing is
    /// recorded.
    Result<FoundSidecar> renameSidecar(const FoundSidecar& promise, const std::string& folder,
                                       const std::string& name);

private:
    std::optional<std::string> relative(const Url& url) const;
    Failure movePresent(const Url& from, const Url& to, bool directory);
    Failure movePromise(const Url& from, const Url& to, const FoundSidecar& promise);
    Failure recordMove(ItemId item, const std::string& to, const FileAttributes& attributes,
                       bool promise);
    /// Puts back on the disk what could not be recorded, so that the answer is true; the error for
    /// people.
    static Error undone(const Error& cause, const Url& from, const Url& to,
                        const std::function<Failure()>& undo);
    /// The item of a folder of the disk, made where the store did not know it yet.
    Result<ItemId> folderItem(const std::string& relative);

    StoreContext& context_;
};

} // namespace platform
