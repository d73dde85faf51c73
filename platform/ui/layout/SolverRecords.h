#pragma once

#include "platform/ui/layout/Solver.h"

namespace platform::layout {

/// What a row loses by a unit of violation on one side. Nothing when `level` is negative.
struct Weight {
    int level = -1;
    double amount = 0;
    /// The row's part in the level of ties: the older, the more.
    double tie = 0;
};

enum class Side { on, below, above };

struct RowState {
    Strength strength;
    Weight below;
    Weight above;
    /// What counts in the present solution, and what is wanted from the next on.
    double constant = 0;
    double wantedConstant = 0;
    /// Value minus constant. Kept for loose rows only.
    double residual = 0;
    std::uint64_t age = 0;
    static constexpr std::size_t noSlot = static_cast<std::size_t>(-1);
    std::size_t slot = noSlot;
    Side side = Side::on;
    bool inUse = false;
    bool isRemoved = false;
    bool isNew = false;
    bool givesWay = false;
    bool isTight() const { return slot != noSlot; }
};

struct VariableState {
    Solver::Kind kind = Solver::Kind::position;
    /// variable == 0: keeps sizes from being negative and everything near zero.
    Row own = -1;
    double value = 0;
    double reported = 0;
    bool isNew = true;
    bool isTouched = false;
    bool isRemoved = false;
};

} // namespace platform::layout
