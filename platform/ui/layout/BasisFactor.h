#pragma once

#include "platform/ui/layout/SlotVector.h"
#include "platform/ui/layout/SparseRows.h"

#include <span>
#include <vector>

namespace platform::layout {

/// The tight rows that hold every variable in its place, factored so that both kinds of question
/// cost about what they touch: which combination of tight rows a given row is (combine), and how
/// the variables move when a tight row's value moves (move).
///
/// Each tight row stands in a slot; a slot also belongs to one variable. factor() renumbers both.
/// Between two factorings, replace() appends a correction.
class BasisFactor {
public:
    /// A row that had to be dropped because the others already determine it: the row of the
    /// variable alone (coefficient 1) stands in that slot now.
    struct Repair {
        std::size_t slot;
        Variable variable;
    };

    /// Factors `rows`, as many as there are variables. Answers in `order` which of them stands in
    /// each slot.
    void factor(const SparseRows& matrix, std::span<const Row> rows,
                std::vector<std::size_t>& order, std::vector<Repair>& repairs);
    /// A new variable, held by the row of itself alone in the last slot.
    void appendIdentity(Variable variable);

    std::size_t size() const { return pivots_.size(); }
    std::size_t slotOf(Variable variable) const {
        return slotOfVariable_[static_cast<std::size_t>(variable)];
    }
    Variable variableOf(std::size_t slot) const { return variableOfSlot_[slot]; }

    /// In: a row's coefficients, each at the slot of its variable. Out: how much of each slot's row
    /// makes up that row.
    void combine(SlotVector& vector) const;
    /// In: changes of the tight rows' values by slot. Out: changes of the variables, each at the
    /// slot of its variable.
    void move(SlotVector& vector) const;

    /// The row whose combination is `column` takes the slot.
    void replace(std::size_t slot, SlotVector& column);
    /// Whether the corrections cost more than factoring afresh.
    bool isWorn() const;

private:
    struct Entry {
        std::size_t index;
        double value;
    };
    /// Entries grouped by slot.
    struct Grouped {
        std::vector<std::size_t> starts{0};
        std::vector<Entry> entries;
        std::span<const Entry> of(std::size_t slot) const {
            return {entries.data() + starts[slot], starts[slot + 1] - starts[slot]};
        }
    };
    struct Correction {
        std::size_t slot;
        double pivot;
        std::size_t begin;
        std::size_t end;
    };
    struct Elimination;

    void take(const Elimination& elimination);

    std::vector<double> pivots_;
    std::vector<std::size_t> slotOfVariable_;
    std::vector<Variable> variableOfSlot_;
    Grouped lowerColumns_, lowerRows_, upperColumns_, upperRows_;
    std::vector<Correction> corrections_;
    std::vector<Entry> correctionEntries_;
};

} // namespace platform::layout
