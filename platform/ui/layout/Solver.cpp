#include "platform/ui/layout/Solver.h"

#include "platform/ui/layout/SolverState.h"

#include <algorithm>
#include <cmath>

namespace platform::layout {

namespace {

/// Beyond any screen; keeps sums of nonsense finite.
constexpr double farthest = 1e8;
constexpr double steepest = 1e6;

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
