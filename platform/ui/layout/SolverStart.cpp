#include "platform/ui/layout/SolverState.h"

#include <algorithm>
#include <cmath>

namespace platform::layout {

namespace {

/// Chooses tight rows as a person would lay out by hand: what is known fixes what comes next,
/// strong rows before weak ones. The choice decides only how much is left to exchange afterwards.
class Propagation {
public:
    explicit Propagation(const Solver::State& state);
    std::vector<Row> choose();

private:
    void know(Variable variable);
    void offer(Row row);
    Row nextOffered();
    Variable unknownOf(Row row) const;
    auto isYounger() const {
        return [this](Row a, Row b) { return state_.at(a).age > state_.at(b).age; };
    }

    const Solver::State& state_;
    std::vector<bool> known_;
    std::vector<std::size_t> unknowns_;
    /// Rows that leave one variable open: what has to hold, in any order, and by level the others,
    /// a heap each with the oldest on top, because the oldest wins a tie.
    std::vector<Row> offeredFirst_;
    std::vector<std::vector<Row>> offered_;
    std::size_t strongest_ = 0;
};

Propagation::Propagation(const Solver::State& state)
    : state_(state),
      known_(state.variables.size(), false),
      unknowns_(state.rows.size(), 0),
      offered_(state.levelCount()) {
    for (std::size_t index = state.rows.size(); index-- > 0;) {
        const auto row = static_cast<Row>(index);
        if (!state.at(row).inUse)
            continue;
        unknowns_[index] = state.matrix.cells(row).size();
        if (unknowns_[index] == 1)
            offer(row);
    }
}

void Propagation::offer(Row row) {
    const RowState& state = state_.at(row);
    // A row that gives way to one side for free says nothing about where things are.
    if (state.below.level < 0 || state.above.level < 0)
        return;
    const auto level = static_cast<std::size_t>(std::max(state.below.level, state.above.level));
    if (level + 1 == state_.levelCount())
        return;
    if (level <= Solver::State::requiredLevel) {
        offeredFirst_.push_back(row);
        return;
    }
    offered_[level].push_back(row);
    std::push_heap(offered_[level].begin(), offered_[level].end(), isYounger());
    strongest_ = std::min(strongest_, level);
}

Row Propagation::nextOffered() {
    const auto last = [](std::vector<Row>& list) {
        const Row row = list.back();
        list.pop_back();
        return row;
    };
    if (!offeredFirst_.empty())
        return last(offeredFirst_);
    for (; strongest_ < offered_.size(); ++strongest_)
        if (auto& list = offered_[strongest_]; !list.empty()) {
            std::pop_heap(list.begin(), list.end(), isYounger());
            return last(list);
        }
    return -1;
}

Variable Propagation::unknownOf(Row row) const {
    double largest = 0;
    const SparseRows::Cell* unknown = nullptr;
    for (const auto& cell : state_.matrix.cells(row)) {
        largest = std::max(largest, std::abs(cell.coefficient));
        if (!known_[static_cast<std::size_t>(cell.variable)])
            unknown = &cell;
    }
    constexpr double tooSmallShare = 1e-3;
    return unknown && std::abs(unknown->coefficient) >= tooSmallShare * largest ? unknown->variable
                                                                                : -1;
}

void Propagation::know(Variable variable) {
    known_[static_cast<std::size_t>(variable)] = true;
    state_.matrix.forColumn(variable, [this](Row row, double) {
        if (--unknowns_[static_cast<std::size_t>(row)] == 1)
            offer(row);
    });
}

std::vector<Row> Propagation::choose() {
    std::vector<Row> chosen;
    chosen.reserve(known_.size());
    const auto spread = [&] {
        for (Row row = nextOffered(); row >= 0; row = nextOffered()) {
            const Variable variable = unknownOf(row);
            if (variable < 0)
                continue;
            chosen.push_back(row);
            know(variable);
        }
    };
    spread();
    // Nothing says how large these are, then where they are: as near to zero as it goes.
    for (const Solver::Kind kind : {Solver::Kind::size, Solver::Kind::position})
        for (std::size_t variable = 0; variable < known_.size(); ++variable)
            if (!known_[variable] && state_.variables[variable].kind == kind) {
                chosen.push_back(state_.variables[variable].own);
                know(static_cast<Variable>(variable));
                spread();
            }
    return chosen;
}

} // namespace

void Solver::State::start() {
    eraseRemoved();
    for (const Row row : movedRows)
        at(row).constant = at(row).wantedConstant;
    for (const Row row : newRows)
        at(row).isNew = false;
    movedRows.clear();
    newRows.clear();
    pulls.clear();
    suspects.clear();
    structuralChanges = 0;
    collectLevels();
    chooseTight();
    refactor();
    for (std::size_t row = 0; row < rows.size(); ++row)
        if (rows[row].inUse && !rows[row].isTight()) {
            rows[row].side = Side::on;
            chooseSide(static_cast<Row>(row));
        }
    findForces();
    needsStart = false;
}

void Solver::State::collectLevels() {
    priorities.assign(1, layout::required);
    for (const RowState& row : rows)
        if (row.inUse)
            for (const float priority : {row.strength.below, row.strength.above})
                if (priority > 0 && priority < layout::required)
                    priorities.push_back(priority);
    std::sort(priorities.begin(), priorities.end(), std::greater<>());
    priorities.erase(std::unique(priorities.begin(), priorities.end()), priorities.end());
    for (std::size_t row = 0; row < rows.size(); ++row)
        if (rows[row].inUse)
            assignWeights(static_cast<Row>(row));
    overloads.assign(2 * levelCount(), {});
    slope.assign(levelCount(), 0);
}

void Solver::State::chooseTight() {
    std::vector<Row> chosen = Propagation(*this).choose();
    for (RowState& row : rows)
        row.slot = RowState::noSlot;
    tight = std::move(chosen);
}

/// Factors the tight rows anew; values and forces come out clean of what rounding left in them.
void Solver::State::refactor() {
    std::vector<std::size_t> order;
    std::vector<BasisFactor::Repair> repairs;
    factor.factor(matrix, tight, order, repairs);
    std::vector<Row> ordered(tight.size());
    for (std::size_t slot = 0; slot < tight.size(); ++slot)
        ordered[slot] = tight[order[slot]];
    for (const auto& repair : repairs) {
        at(ordered[repair.slot]).slot = RowState::noSlot;
        ordered[repair.slot] = variables[static_cast<std::size_t>(repair.variable)].own;
    }
    tight = std::move(ordered);
    for (std::size_t slot = 0; slot < tight.size(); ++slot) {
        at(tight[slot]).slot = slot;
        at(tight[slot]).side = Side::on;
    }
    findValues();
}

/// Goes on from the same rows with clean numbers.
void Solver::State::refresh() {
    refactor();
    for (std::size_t row = 0; row < rows.size(); ++row)
        if (rows[row].inUse && !rows[row].isTight() && rows[row].side == Side::on)
            chooseSide(static_cast<Row>(row));
    findForces();
}

void Solver::State::findValues() {
    work.clear();
    for (std::size_t slot = 0; slot < tight.size(); ++slot)
        if (at(tight[slot]).constant != 0)
            work.add(slot, at(tight[slot]).constant);
    factor.move(work);
    for (std::size_t slot = 0; slot < tight.size(); ++slot) {
        const Variable variable = factor.variableOf(slot);
        variables[static_cast<std::size_t>(variable)].value = work[slot];
        touch(variable);
    }
    for (std::size_t index = 0; index < rows.size(); ++index) {
        RowState& row = rows[index];
        if (!row.inUse || row.isTight())
            continue;
        row.residual = -row.constant;
        for (const auto& cell : matrix.cells(static_cast<Row>(index)))
            row.residual +=
                cell.coefficient * variables[static_cast<std::size_t>(cell.variable)].value;
    }
}

void Solver::State::findForces() {
    forces.assign(tight.size() * levelCount(), 0);
    touchedSlots.clear();
    isTouchedSlot.assign(tight.size(), false);
    for (auto& heap : overloads)
        heap.clear();
    pulls.clear();
    for (std::size_t row = 0; row < rows.size(); ++row)
        if (rows[row].inUse)
            queuePull(static_cast<Row>(row), 1);
    for (std::size_t slot = 0; slot < tight.size(); ++slot)
        changeForce(slot, 0, 0);
    applyPulls();
    checkTouchedSlots();
}

} // namespace platform::layout
