#pragma once

#include "platform/cloud/Remote.h"
#include "platform/cloud/StoreContext.h"

#include <functional>

namespace platform {

/// Deletes a whole library on both sides. The remote is read first, so that one that is away
/// changes nothing; then the device's part goes to the kept folder; then the remote's goes, item by
/// item, each in the version that was read and recoverably. What cannot be deleted there stays
/// recorded as deleted by the user.
class ContainerDeletion {
public:
    ContainerDeletion(StoreContext& context, CancelFlag& cancel)
        : context_(context), cancel_(cancel) {}

    /// `folder` is the library's, a name at the top of the store. Not on the store's queue.
    [[nodiscard]] Failure run(const std::string& folder);

private:
    struct Found {
        std::string path;
        RemoteEntry entry;
    };
    /// Folders before what is in them.
    Failure readRemote(const std::string& path);
    Failure removeHere(const std::string& folder);
    Failure removeThere();

    StoreContext& context_;
    CancelFlag& cancel_;
    std::vector<Found> found_;
};

} // namespace platform
