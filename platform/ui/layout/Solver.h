#pragma once

#include "platform/ui/layout/SparseRows.h"

#include <cstdint>
#include <memory>
#include <span>
#include <vector>

namespace platform::layout {

/// The priority of a requirement.
inline constexpr float required = 1000;

/// How strongly a row resists being too small (`below`) and too large (`above`): a priority from 1
/// to 1000, of which 1000 is a requirement, or 0 for no resistance. An equality resists both ways,
/// x >= c only below.
struct Strength {
    float below = 0;
    float above = 0;
    bool operator==(const Strength&) const = default;
};

/// Finds values for variables so that rows of the form sum(coefficient * variable) == constant hold
/// as well as they can: of all values it takes those with the least sum of violations among the
/// rows of the highest priority, of those the least sum at the next priority, and so on; a higher
/// priority wins over any sum of lower ones. What the rows leave open goes to the rows added first,
/// and then to the values nearest to zero, so the answer is one and the same however it was
/// reached.
///
/// Requirements that contradict each other: the youngest of those involved gives way. It then only
/// attracts (above every priority below 1000) until it fits again.
///
/// An incremental simplex on the rows themselves: as many tight rows as there are variables hold
/// the values in place; a change moves values, and rows are exchanged one by one until no exchange
/// improves the answer. Always ends; any numbers will do, even those that are none.
class Solver {
public:
    /// A size is never negative; a position may be.
    enum class Kind { position, size };
    struct Conflict {
        Row row;
        /// The requirements that it could not be reconciled with.
        std::vector<Row> against;
    };

    Solver();
    ~Solver();
    Solver(const Solver&) = delete;
    Solver& operator=(const Solver&) = delete;

    Variable addVariable(Kind kind);
    /// Its rows have to be removed before the next solve().
    void removeVariable(Variable variable);
    /// `age` orders the rows, the oldest first; a requirement of age 0 never gives way, and those
    /// must not contradict each other.
    Row addRow(std::span<const Term> terms, double constant, Strength strength, std::uint64_t age);
    void removeRow(Row row);
    void setConstant(Row row, double constant);
    void setStrength(Row row, Strength strength);

    bool needsSolve() const;
    void solve();

    double value(Variable variable) const;
    /// The variables that the last solve() gave another value, and those that are new.
    const std::vector<Variable>& changed() const;
    /// The requirements that give way now, oldest first.
    const std::vector<Conflict>& conflicts() const;
    /// How many rows the last solve() exchanged: its work.
    std::size_t exchanges() const;
    /// Whether the last solve() ran into its limit of work: the answer meets what it could.
    bool isCutShort() const;

    struct State;

private:
    std::unique_ptr<State> state_;
};

} // namespace platform::layout
