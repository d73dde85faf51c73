#include "platform/ui/layout/SolverState.h"

#include <algorithm>
#include <cmath>

namespace platform::layout {

namespace {

/// Values that differ by less, in points, are the same.
constexpr double valueTolerance = 1e-9;

} // namespace

Solver::State::State() : priorities{layout::required} {
}

Variable Solver::State::appendVariable() {
    const auto variable = static_cast<Variable>(variables.size());
    matrix.addVariable();
    variables.emplace_back();
    const Term own{variable, 1};
    const Row row = insertRow({&own, 1}, 0, {}, 0);
    at(row).slot = tight.size();
    variables.back().own = row;
    factor.appendIdentity(variable);
    tight.push_back(row);
    forces.resize(tight.size() * levelCount(), 0);
    isTouchedSlot.push_back(false);
    for (SlotVector* vector : {&slideVector, &combination, &work})
        vector->resize(tight.size());
    return variable;
}

Row Solver::State::insertRow(std::span<const Term> terms, double constant, Strength strength,
                             std::uint64_t age) {
    const Row row = matrix.add(terms);
    rows.resize(matrix.rowCount());
    RowState& state = at(row);
    state = {};
    state.strength = strength;
    state.constant = state.wantedConstant = constant;
    state.age = age;
    state.inUse = true;
    return row;
}

void Solver::State::touch(Variable variable) {
    VariableState& state = variables[static_cast<std::size_t>(variable)];
    if (!state.isTouched) {
        state.isTouched = true;
        touched.push_back(variable);
    }
}

void Solver::State::prepare() {
    // Past this, choosing all tight rows anew is less work than exchanging them one by one.
    if (needsStart || structuralChanges > 24 + rows.size() / 6)
        start();
    else
        update();
}

void Solver::State::update() {
    moveConstants();
    for (const Row row : newRows) {
        RowState& state = at(row);
        state.isNew = false;
        if (state.isRemoved)
            continue;
        state.residual = -state.constant;
        for (const auto& cell : matrix.cells(row))
            state.residual +=
                cell.coefficient * variables[static_cast<std::size_t>(cell.variable)].value;
        chooseSide(row);
    }
    newRows.clear();
    applyPulls();
    checkTouchedSlots();
    if (releaseRemoved()) {
        eraseRemoved();
        structuralChanges = 0;
    } else {
        start();
    }
}

/// Tight rows take the variables along with their constants; loose ones only change what they miss.
void Solver::State::moveConstants() {
    slideVector.clear();
    for (const Row row : movedRows) {
        RowState& state = at(row);
        const double change = state.wantedConstant - state.constant;
        state.constant = state.wantedConstant;
        if (state.isTight()) {
            slideVector.add(state.slot, change);
        } else {
            state.residual -= change;
            chooseSide(row);
        }
    }
    movedRows.clear();
    factor.move(slideVector);
    findRates();
    moveBy(1);
    for (const Row row : ratedRows)
        if (!at(row).isTight() && !at(row).isNew)
            chooseSide(row);
    forgetRates();
}

/// Removed rows weigh nothing any more, but those that are tight still hold their variables.
bool Solver::State::releaseRemoved() {
    for (const Row row : removedRows) {
        if (!at(row).isTight())
            continue;
        const auto over = overload(at(row).slot);
        const int direction = over ? over->direction : 1;
        ++exchanges;
        if (!exchange(at(row).slot, direction) && !exchange(at(row).slot, -direction))
            return false;
        if (factor.isWorn())
            refresh();
    }
    return true;
}

void Solver::State::eraseRemoved() {
    for (const Row row : removedRows) {
        matrix.remove(row);
        at(row) = {};
    }
    removedRows.clear();
    // One that still stands in a row waits until that row goes as well.
    std::erase_if(removedVariables, [this](Variable variable) {
        std::size_t count = 0;
        matrix.forColumn(variable, [&](Row, double) { ++count; });
        if (count == 1)
            freeVariables.push_back(variable);
        return count == 1;
    });
}

void Solver::State::collect() {
    changed.clear();
    for (const Variable variable : touched) {
        VariableState& state = variables[static_cast<std::size_t>(variable)];
        state.isTouched = false;
        if (state.isRemoved ||
            (!state.isNew && std::abs(state.value - state.reported) <= valueTolerance))
            continue;
        state.isNew = false;
        state.reported = state.value;
        changed.push_back(variable);
    }
    touched.clear();
}

} // namespace platform::layout
