#pragma once

#include "platform/cloud/StateRecords.h"

#include <cstdint>
#include <string>

// What people see of the work that makes both sides of a store agree.

namespace platform {

/// So much has vanished from one side at once that the user is asked before the other side follows.
struct DeletionQuestion {
    /// Where it vanished.
    Side side = Side::local;
    std::int64_t items = 0;
    /// Of them, those that nobody can bring back: they vanished from the account, and of their
    /// contents nothing is on the device.
    std::int64_t lost = 0;
    bool operator==(const DeletionQuestion&) const = default;
};
/// For people: what has vanished where, and that nothing follows from it before they say so.
std::string textOf(const DeletionQuestion& question);

enum class DeletionAnswer {
    /// It is deleted on the other side as well, recoverably.
    deleteThem,
    /// What the other side has comes back.
    putBack
};

/// Work that could not be done yet.
struct PendingWork {
    ItemId item = 0;
    /// As nameOf(StepKind) has it.
    std::string kind;
    /// Relative to the store.
    std::string path;
    int tries = 0;
    Date nextAt;
    /// For people.
    std::string cause;
};

} // namespace platform
