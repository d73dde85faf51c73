#pragma once

#include "platform/cloud/Remote.h"
#include "platform/cloud/StoreContext.h"

namespace platform {

/// The last steps of a download, all on the store's queue: name, record, sidecar. Each is durable
/// before the next begins.
class ContentPlacing {
public:
    explicit ContentPlacing(StoreContext& context) : context_(context) {}

    /// Puts the staged content (a name in the staging folder) in the place of the promise that lies
    /// at `wanted` (relative to the store's root), or where it was moved meanwhile. noSuchItem when
    /// the promise is gone; fileExists when something else has taken the name.
    [[nodiscard]] Failure place(ItemId item, const std::string& wanted, const std::string& staged,
                                const RemoteEntry& version, const Bytes& hash);

    /// Finishes or undoes an operation that a stopped program left.
    void resume(const OpRow& op);

private:
    struct Target {
        std::string relative;
        FoundSidecar sidecar;
        /// The item's own promise, not a copy that somebody made of it.
        bool own = false;
    };
    std::optional<Target> targetFor(ItemId item, const std::string& wanted);
    Failure record(ItemId item, OpRow op, const FileAttributes& attributes,
                   const RemoteEntry* version);
    Failure removeSidecar(const std::string& path, std::int64_t op);

    StoreContext& context_;
};

} // namespace platform
