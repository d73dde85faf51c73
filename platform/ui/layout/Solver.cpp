#include "platform/ui/layout/Solver.h"

#include "platform/ui/layout/SolverState.h"

#include <algorithm>
#include <cmath>

namespace platform::layout {

namespace {

/// Beyond any screen; keeps sums of nonsense finite.
constexpr double farthest = 1e8;
constexpr double steepest = 1e6;
/// Values that differ by less, in points, are the same.
constexpr double valueTolerance = 1e-9;

double clean(double value, double limit) {
    return std::isnan(value) ? 0 : std::clamp(value, -limit, limit);
}

/// Each variable once, no zero coefficients.
std::vector<Term> cleanTerms(std::span<const Term> terms) {
    std::vector<Term> sum;
    sum.reserve(terms.size());
    for (const Term& term : terms) {
        const auto same = std::find_if(sum.begin(), sum.end(), [&](const Term& earlier) {
            return earlier.variable == term.variable;
        });
        const double coefficient = clean(term.coefficient, steepest);
        if (same != sum.end())
            same->coefficient += coefficient;
        else
            sum.push_back({term.variable, coefficient});
    }
    constexpr double smallest = 1e-9;
    std::erase_if(sum, [](const Term& term) { return std::abs(term.coefficient) < smallest; });
    return sum;
}

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

Solver::Solver() : state_(std::make_unique<State>()) {
}
Solver::~Solver() = default;

Variable Solver::addVariable(Kind kind) {
    Variable variable;
    if (state_->freeVariables.empty()) {
        variable = state_->appendVariable();
    } else {
        variable = state_->freeVariables.back();
        state_->freeVariables.pop_back();
    }
    VariableState& added = state_->variables[static_cast<std::size_t>(variable)];
    added.kind = kind;
    added.isRemoved = false;
    added.isNew = true;
    if (!state_->needsStart)
        state_->changeWeights(added.own);
    state_->touch(variable);
    state_->isDirty = true;
    return variable;
}

void Solver::removeVariable(Variable variable) {
    state_->variables[static_cast<std::size_t>(variable)].isRemoved = true;
    state_->removedVariables.push_back(variable);
    state_->isDirty = true;
}

Row Solver::addRow(std::span<const Term> terms, double constant, Strength strength,
                   std::uint64_t age) {
    const Row row = state_->insertRow(cleanTerms(terms), clean(constant, farthest), strength, age);
    state_->at(row).isNew = true;
    state_->newRows.push_back(row);
    ++state_->structuralChanges;
    state_->isDirty = true;
    if (!state_->knowsPriority(strength.below) || !state_->knowsPriority(strength.above))
        state_->needsStart = true;
    else if (!state_->needsStart)
        state_->assignWeights(row);
    return row;
}

void Solver::removeRow(Row row) {
    state_->at(row).isRemoved = true;
    state_->removedRows.push_back(row);
    if (!state_->needsStart)
        state_->changeWeights(row);
    ++state_->structuralChanges;
    state_->isDirty = true;
    std::erase_if(state_->conflicts, [row](const Conflict& c) { return c.row == row; });
    for (Conflict& conflict : state_->conflicts)
        std::erase(conflict.against, row);
}

void Solver::setConstant(Row row, double constant) {
    RowState& state = state_->at(row);
    const double wanted = clean(constant, farthest);
    if (state.wantedConstant == wanted)
        return;
    state.wantedConstant = wanted;
    state_->isDirty = true;
    // One that is listed twice moves only once: the second time nothing is left to change.
    if (state.isNew)
        state.constant = wanted;
    else
        state_->movedRows.push_back(row);
}

void Solver::setStrength(Row row, Strength strength) {
    RowState& state = state_->at(row);
    if (state.strength == strength)
        return;
    state.strength = strength;
    state_->isDirty = true;
    if (state.givesWay) {
        state.givesWay = false;
        std::erase_if(state_->conflicts, [row](const Conflict& c) { return c.row == row; });
    }
    if (!state_->knowsPriority(strength.below) || !state_->knowsPriority(strength.above))
        state_->needsStart = true;
    else if (!state_->needsStart)
        state_->changeWeights(row);
}

bool Solver::needsSolve() const {
    return state_->isDirty;
}

void Solver::solve() {
    state_->changed.clear();
    state_->exchanges = 0;
    state_->isCutShort = false;
    if (!state_->isDirty)
        return;
    state_->isDirty = false;
    state_->prepare();
    state_->settleConflicts();
    state_->collect();
}

double Solver::value(Variable variable) const {
    return state_->variables[static_cast<std::size_t>(variable)].value;
}

const std::vector<Variable>& Solver::changed() const {
    return state_->changed;
}

const std::vector<Solver::Conflict>& Solver::conflicts() const {
    return state_->conflicts;
}

std::size_t Solver::exchanges() const {
    return state_->exchanges;
}

bool Solver::isCutShort() const {
    return state_->isCutShort;
}

} // namespace platform::layout
