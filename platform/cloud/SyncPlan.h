#pragma once

#include "platform/cloud/SyncTrees.h"

#include <set>
#include <string>
#include <vector>

namespace platform {

/// One thing to do so that the two sides of an item come closer.
enum class StepKind {
    // Records alone.
    adopt,  // both sides are the same, at the same place
    merge,  // a new local item is what the remote has at its place: `other` takes it over
    forget, // neither side has it
    // On the disk.
    arrive,    // a folder, or a promise, for what the remote has
    moveHere,  // to the remote's place
    stepAside, // to a name of its own: the remote has another item for this one
    keep,      // deleted on the remote: to the kept folder
    // On the remote.
    makeFolder,
    moveThere, // to the place on the disk
    remove,    // deleted by the user
    // Contents.
    upload,       // nothing of it is on the remote
    uploadChange, // in place of the version that was agreed on
    download,     // in place of the content that was agreed on
    reconcile,    // both sides have something of their own
};

struct SyncStep {
    StepKind kind = StepKind::adopt;
    ItemId item = 0;
    /// Of moves; of what is made, where.
    Place to;
    /// Of merge.
    ItemId other = 0;
    bool operator==(const SyncStep&) const = default;
};

struct PlanOptions {
    /// Files that had lost all their bytes when the machine had stopped in the middle of writing:
    /// that is damage, and no edit.
    std::set<ItemId> damaged;
};

/// The content may be what is left of one that was being written when the machine stopped.
bool looksDamaged(const ItemState& state);

/// What can be done now, in an order in which it can be done. What has to wait for it is in a later
/// plan. A pure function: depends on the trees alone. An empty plan means that they agree.
std::vector<SyncStep> planSync(const SyncTrees& trees, const PlanOptions& options = {});

/// For logs, and for what people see of pending work.
std::string_view nameOf(StepKind kind);
inline bool isContentStep(StepKind kind) {
    return kind >= StepKind::upload;
}

} // namespace platform
