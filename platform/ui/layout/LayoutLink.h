#pragma once

#include "platform/ui/LayoutConstraint.h"

#include <vector>

namespace platform {

class LayoutEngine;
class LayoutItem;
struct LayoutRecord;

/// What outlives an item: constraints hold it in place of the item. Only the layout code's own
/// files know it.
struct LayoutLink {
    /// None once the item is dead.
    LayoutItem* item = nullptr;
    /// Where the item was added, and that engine's page about it.
    LayoutEngine* engine = nullptr;
    LayoutRecord* record = nullptr;
    /// The active constraints that mention the item: awake, asleep or given way. Kept alive here.
    std::vector<LayoutConstraint::Pointer> active;
};

} // namespace platform
