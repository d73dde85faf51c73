#pragma once

#include "platform/cloud/Remote.h"
#include "platform/cloud/StoreContext.h"

#include <optional>
#include <string>
#include <unordered_set>

namespace platform {

/// Gives an item of the remote its place on the disk: a folder, a promise, or, for the small files
/// that describe containers, the content. What stands there already is never touched: a folder is
/// taken over, a promise is taken over, anything else stays the user's.
class Arrivals {
public:
    struct Spot {
        ItemId folder = 0;
        /// Relative to the store's root, "" for the root.
        std::string relative;
        /// Absolute.
        std::string path;
        std::string remotePath;
        /// What lies there already.
        std::unordered_set<std::string> names;
    };
    struct Outcome {
        ItemId item = 0;
        std::optional<LocalRow> local;
        std::optional<BaseRow> base;
        bool madeFolder = false;
        /// Why the item cannot be here; then nothing else is set.
        std::optional<std::string> refused;
    };

    Arrivals(StoreContext& context, CancelFlag& cancel) : context_(context), cancel_(cancel) {}

    /// `item` is the entry's item where it has one already. An error means that the disk, or the
    /// remote, does not work; fileExists, that the name is another item's promise's.
    Result<Outcome> arrive(const Spot& spot, const RemoteEntry& entry, std::optional<ItemId> item);

    /// A file that is fetched when it is listed.
    static bool isFetchedAtOnce(const Spot& spot, const RemoteEntry& entry);
    /// Fetches it again, unless the local one was changed.
    Result<Outcome> renew(const Spot& spot, const RemoteEntry& entry, const ItemState& state);

private:
    Result<Outcome> takeFolder(const Spot& spot, const RemoteEntry& entry, Outcome outcome);
    Result<Outcome> takeExisting(const Spot& spot, const RemoteEntry& entry, Outcome outcome);
    Result<Outcome> promise(const Spot& spot, const RemoteEntry& entry, Outcome outcome);
    Result<Outcome> fetch(const Spot& spot, const RemoteEntry& entry, Outcome outcome);
    /// A new promise under that name, or the one that lies there already; none when the name is
    /// taken by something else.
    Result<std::optional<Outcome>> promiseAs(const SidecarName& name, const Spot& spot,
                                             const RemoteEntry& entry, const Outcome& outcome);
    Result<std::optional<Outcome>> takeOver(const Spot& spot, const SidecarName& name,
                                            const RemoteEntry& entry, const Outcome& outcome);
    bool isKnown(ItemId item);
    /// The item's own promise lies elsewhere than at `path`.
    bool isCopy(ItemId item, const std::string& path);

    StoreContext& context_;
    CancelFlag& cancel_;
};

} // namespace platform
