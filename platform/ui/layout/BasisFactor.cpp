#include "platform/ui/layout/BasisFactor.h"

#include "platform/ui/layout/BasisElimination.h"

#include <cmath>

namespace platform::layout {

namespace {

/// What is left of terms that cancelled.
constexpr double noise = 1e-13;

} // namespace

void BasisFactor::take(const Elimination& elimination) {
    const std::size_t count = elimination.size;
    std::vector<std::size_t> slotOfColumn(count);
    slotOfVariable_.resize(count);
    variableOfSlot_.resize(count);
    for (std::size_t slot = 0; slot < count; ++slot) {
        slotOfColumn[elimination.columnOfPivot[slot]] = slot;
        slotOfVariable_[elimination.variableOfPivot[slot]] = slot;
        variableOfSlot_[slot] = static_cast<Variable>(elimination.variableOfPivot[slot]);
    }
    // The same factors twice: grouped by the slot that they come from and by the one they reach.
    const auto group = [&](const std::vector<Elimination::Factor>& factors,
                           const std::vector<std::size_t>& slotOfOther, bool byPivot,
                           Grouped& grouped) {
        grouped.starts.assign(count + 1, 0);
        grouped.entries.resize(factors.size());
        for (const auto& factor : factors)
            ++grouped.starts[(byPivot ? factor.pivot : slotOfOther[factor.other]) + 1];
        for (std::size_t slot = 0; slot < count; ++slot)
            grouped.starts[slot + 1] += grouped.starts[slot];
        std::vector<std::size_t> next(grouped.starts.begin(), grouped.starts.end() - 1);
        for (const auto& factor : factors) {
            const std::size_t other = slotOfOther[factor.other];
            const std::size_t key = byPivot ? factor.pivot : other;
            grouped.entries[next[key]++] = {byPivot ? other : factor.pivot, factor.value};
        }
    };
    group(elimination.lower, slotOfVariable_, true, lowerColumns_);
    group(elimination.lower, slotOfVariable_, false, lowerRows_);
    group(elimination.upper, slotOfColumn, true, upperRows_);
    group(elimination.upper, slotOfColumn, false, upperColumns_);
}

void BasisFactor::factor(const SparseRows& matrix, std::span<const Row> rows,
                         std::vector<std::size_t>& order, std::vector<Repair>& repairs) {
    Elimination elimination(matrix, rows);
    elimination.peelColumns();
    elimination.peelLines();
    elimination.eliminateRest();
    repairs.clear();
    elimination.repair(repairs);
    take(elimination);
    order = std::move(elimination.columnOfPivot);
    pivots_ = std::move(elimination.pivots);
    corrections_.clear();
    correctionEntries_.clear();
}

void BasisFactor::appendIdentity(Variable variable) {
    slotOfVariable_.push_back(pivots_.size());
    variableOfSlot_.push_back(variable);
    pivots_.push_back(1);
    for (Grouped* grouped : {&lowerColumns_, &lowerRows_, &upperColumns_, &upperRows_})
        grouped->starts.push_back(grouped->starts.back());
}

void BasisFactor::combine(SlotVector& vector) const {
    if (!lowerColumns_.entries.empty())
        vector.ascending([&](std::size_t slot, double value) {
            if (std::abs(value) > noise)
                for (const Entry& entry : lowerColumns_.of(slot))
                    vector.add(entry.index, -entry.value * value);
        });
    vector.descending([&](std::size_t slot, double value) {
        if (std::abs(value) <= noise) {
            vector.set(slot, 0);
            return;
        }
        const double share = value / pivots_[slot];
        vector.set(slot, share);
        for (const Entry& entry : upperColumns_.of(slot))
            vector.add(entry.index, -entry.value * share);
    });
    for (const Correction& correction : corrections_) {
        const double value = vector[correction.slot];
        if (std::abs(value) <= noise)
            continue;
        const double share = value / correction.pivot;
        vector.set(correction.slot, share);
        for (std::size_t i = correction.begin; i < correction.end; ++i)
            vector.add(correctionEntries_[i].index, -correctionEntries_[i].value * share);
    }
}

void BasisFactor::move(SlotVector& vector) const {
    for (std::size_t c = corrections_.size(); c-- > 0;) {
        const Correction& correction = corrections_[c];
        double sum = vector[correction.slot];
        for (std::size_t i = correction.begin; i < correction.end; ++i)
            sum -= correctionEntries_[i].value * vector[correctionEntries_[i].index];
        if (std::abs(sum) > noise)
            vector.set(correction.slot, sum / correction.pivot);
        else if (vector[correction.slot] != 0)
            vector.set(correction.slot, 0);
    }
    vector.ascending([&](std::size_t slot, double value) {
        if (std::abs(value) <= noise) {
            vector.set(slot, 0);
            return;
        }
        const double amount = value / pivots_[slot];
        vector.set(slot, amount);
        for (const Entry& entry : upperRows_.of(slot))
            vector.add(entry.index, -entry.value * amount);
    });
    if (!lowerRows_.entries.empty())
        vector.descending([&](std::size_t slot, double value) {
            if (std::abs(value) > noise)
                for (const Entry& entry : lowerRows_.of(slot))
                    vector.add(entry.index, -entry.value * value);
        });
}

void BasisFactor::replace(std::size_t slot, SlotVector& column) {
    const std::size_t begin = correctionEntries_.size();
    column.ascending([&](std::size_t other, double value) {
        if (other != slot && std::abs(value) > noise)
            correctionEntries_.push_back({other, value});
    });
    corrections_.push_back({slot, column[slot], begin, correctionEntries_.size()});
}

bool BasisFactor::isWorn() const {
    return corrections_.size() > 48 + pivots_.size() / 16 ||
           correctionEntries_.size() > 256 + 2 * pivots_.size();
}

} // namespace platform::layout
