#include "platform/ui/layout/SolverState.h"

#include <algorithm>
#include <cmath>

namespace platform::layout {

namespace {

/// How far, in points, a requirement may be missed before it counts as missed.
constexpr double violationTolerance = 1e-6;
constexpr double violationShare = 1e-9;
constexpr double conflictForce = 1e-7;

} // namespace

bool Solver::State::isViolated(Row row) const {
    const RowState& state = at(row);
    const double tolerance = violationTolerance + violationShare * std::abs(state.constant);
    return state.side == Side::above ? state.residual > tolerance : -state.residual > tolerance;
}

/// The answer without any contradiction: of all requirements, taken from the oldest on, each holds
/// that fits those before it.
void Solver::State::settleConflicts() {
    const bool hadConflicts = !conflicts.empty();
    resolve();
    if (!hadConflicts && conflicts.size() <= 1)
        return;
    // What gave way may fit again, at the price of a younger one at most: try the oldest first.
    std::uint64_t settled = 0;
    for (;;) {
        const auto next = std::find_if(conflicts.begin(), conflicts.end(),
                                       [&](const Conflict& c) { return at(c.row).age > settled; });
        if (next == conflicts.end() || isCutShort)
            return;
        settled = at(next->row).age;
        takeBack(next->row);
        resolve();
    }
}

void Solver::State::resolve() {
    for (;;) {
        optimise();
        std::sort(suspects.begin(), suspects.end());
        suspects.erase(std::unique(suspects.begin(), suspects.end()), suspects.end());
        std::erase_if(suspects, [this](Row row) {
            const RowState& state = at(row);
            const Weight& weight = state.side == Side::above ? state.above : state.below;
            return !state.inUse || state.side == Side::on || weight.level != requiredLevel;
        });
        if (isCutShort || std::none_of(suspects.begin(), suspects.end(),
                                       [this](Row row) { return isViolated(row); }))
            return;
        std::vector<Row> involved = contradiction();
        const auto youngest =
            std::max_element(involved.begin(), involved.end(),
                             [this](Row a, Row b) { return at(a).age < at(b).age; });
        if (youngest == involved.end() || at(*youngest).age == 0)
            return;
        const Row row = *youngest;
        involved.erase(youngest);
        giveWay(row, std::move(involved));
    }
}

/// Requirements whose forces hold each other in balance: together they cannot all be met.
std::vector<Row> Solver::State::contradiction() const {
    std::vector<Row> involved = suspects;
    for (std::size_t slot = 0; slot < tight.size(); ++slot)
        if (std::abs(forces[slot * levelCount() + requiredLevel]) > conflictForce)
            involved.push_back(tight[slot]);
    return involved;
}

void Solver::State::giveWay(Row row, std::vector<Row> against) {
    at(row).givesWay = true;
    const auto place = std::find_if(conflicts.begin(), conflicts.end(),
                                    [&](const Conflict& c) { return at(c.row).age > at(row).age; });
    conflicts.insert(place, {row, std::move(against)});
    changeWeights(row);
}

void Solver::State::takeBack(Row row) {
    at(row).givesWay = false;
    std::erase_if(conflicts, [row](const Conflict& conflict) { return conflict.row == row; });
    changeWeights(row);
}

} // namespace platform::layout
