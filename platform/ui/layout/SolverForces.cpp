#include "platform/ui/layout/SolverState.h"

#include <algorithm>
#include <cmath>

namespace platform::layout {

namespace {

/// Forces are sums and shares of weights near 1; below this they are rounding errors.
constexpr double forceTolerance = 1e-9;
constexpr double forceNoise = 1e-12;
/// How far, in points, a row may be off before it counts as off.
constexpr double residualTolerance = 1e-8;

/// Falls so slowly that neighbours among the first million rows still differ.
double tieWeight(std::uint64_t age) {
    return 1 + 1 / (1 + std::log2(2 + static_cast<double>(age)));
}

bool isLighter(const Solver::State::Overload& a, const Solver::State::Overload& b) {
    return a.excess != b.excess ? a.excess < b.excess : a.tieExcess < b.tieExcess;
}

/// From 0 to 1, without any pattern: with such weights no two answers are equally near to zero.
double irregular(std::size_t variable) {
    auto bits = static_cast<std::uint32_t>(variable) * 2654435769U;
    bits = (bits ^ (bits >> 15)) * 2246822519U;
    bits = (bits ^ (bits >> 13)) * 3266489917U;
    return (bits ^ (bits >> 16)) / 4294967296.0;
}

} // namespace

double Solver::State::weightAt(const Weight& weight, std::size_t level) const {
    if (weight.level < 0)
        return 0;
    if (static_cast<std::size_t>(weight.level) == level)
        return weight.amount;
    return level == tieLevel() ? weight.tie : 0;
}

bool Solver::State::knowsPriority(float priority) const {
    return priority <= 0 || priority >= layout::required ||
           std::binary_search(priorities.begin(), priorities.end(), priority, std::greater<>());
}

Weight Solver::State::weightFor(float priority, const RowState& row) const {
    if (row.isRemoved || priority <= 0)
        return {};
    if (priority >= layout::required && !row.givesWay)
        return {row.age == 0 ? givenLevel : requiredLevel, 1, 0};
    const auto found = std::lower_bound(priorities.begin(), priorities.end(),
                                        std::min(priority, layout::required), std::greater<>());
    return {static_cast<int>(found - priorities.begin()) + firstPriorityLevel, 1,
            tieWeight(row.age)};
}

void Solver::State::assignWeights(Row row) {
    RowState& state = at(row);
    const auto cells = matrix.cells(row);
    const bool isOwn =
        cells.size() == 1 && variables[static_cast<std::size_t>(cells[0].variable)].own == row;
    if (!isOwn) {
        state.below = weightFor(state.strength.below, state);
        state.above = weightFor(state.strength.above, state);
        return;
    }
    const auto variable = static_cast<std::size_t>(cells[0].variable);
    const bool isSize = variables[variable].kind == Kind::size;
    const double amount = (isSize ? 1.0 : 2.0) * (1 + 0.2 * irregular(variable));
    state.above = {static_cast<int>(tieLevel()) + 1, amount, 0};
    state.below = isSize ? Weight{requiredLevel, 1, 0} : state.above;
}

void Solver::State::changeWeights(Row row) {
    queuePull(row, -1);
    assignWeights(row);
    queuePull(row, 1);
    const RowState& state = at(row);
    if (state.isTight()) {
        changeForce(state.slot, 0, 0);
    } else if (state.side != Side::on) {
        const Weight& weight = state.side == Side::above ? state.above : state.below;
        if (weight.level == requiredLevel)
            suspects.push_back(row);
    }
}

void Solver::State::queuePull(Row row, double sign) {
    const RowState& state = at(row);
    if (state.isTight() || state.side == Side::on)
        return;
    const bool isAbove = state.side == Side::above;
    const Weight& weight = isAbove ? state.above : state.below;
    if (weight.level < 0)
        return;
    const double direction = isAbove ? sign : -sign;
    pulls.push_back({weight.level, row, direction * weight.amount});
    if (weight.tie != 0)
        pulls.push_back({static_cast<int>(tieLevel()), row, direction * weight.tie});
}

void Solver::State::setSide(Row row, Side side) {
    RowState& state = at(row);
    if (state.side == side)
        return;
    queuePull(row, -1);
    state.side = side;
    queuePull(row, 1);
    if ((side == Side::above && state.above.level == requiredLevel) ||
        (side == Side::below && state.below.level == requiredLevel))
        suspects.push_back(row);
}

void Solver::State::chooseSide(Row row) {
    // A row that is met exactly keeps its side: any pull up to its weight is right there.
    const double residual = at(row).residual;
    if (residual > residualTolerance)
        setSide(row, Side::above);
    else if (residual < -residualTolerance)
        setSide(row, Side::below);
}

void Solver::State::applyPulls() {
    std::stable_sort(pulls.begin(), pulls.end(),
                     [](const Pull& a, const Pull& b) { return a.level < b.level; });
    for (std::size_t i = 0; i < pulls.size();) {
        const int level = pulls[i].level;
        work.clear();
        for (; i < pulls.size() && pulls[i].level == level; ++i)
            for (const auto& cell : matrix.cells(pulls[i].row))
                work.add(factor.slotOf(cell.variable), cell.coefficient * pulls[i].amount);
        factor.combine(work);
        work.ascending([&](std::size_t slot, double amount) {
            changeForce(slot, static_cast<std::size_t>(level), -amount);
        });
    }
    pulls.clear();
}

void Solver::State::changeForce(std::size_t slot, std::size_t level, double amount) {
    double& force = forces[slot * levelCount() + level];
    force += amount;
    if (std::abs(force) < forceNoise)
        force = 0;
    if (!isTouchedSlot[slot]) {
        isTouchedSlot[slot] = true;
        touchedSlots.push_back(slot);
    }
}

void Solver::State::checkTouchedSlots() {
    for (const std::size_t slot : touchedSlots) {
        isTouchedSlot[slot] = false;
        if (const auto found = overload(slot)) {
            auto& heap = overloads[found->rank];
            heap.push_back(*found);
            std::push_heap(heap.begin(), heap.end(), isLighter);
        }
    }
    touchedSlots.clear();
}

std::optional<Solver::State::Overload> Solver::State::overload(std::size_t slot) const {
    const RowState& row = at(tight[slot]);
    const std::size_t levels = levelCount();
    const double* force = &forces[slot * levels];
    for (const int direction : {1, -1}) {
        const Weight& limit = direction > 0 ? row.above : row.below;
        for (std::size_t level = 0; level < levels; ++level) {
            const double excess = direction * force[level] - weightAt(limit, level);
            if (excess > forceTolerance) {
                const bool isOwnLevel = limit.level == static_cast<int>(level);
                return Overload{slot, direction, 2 * level + (isOwnLevel ? 1 : 0), excess,
                                direction * force[tieLevel()] - weightAt(limit, tieLevel())};
            }
            if (excess < -forceTolerance)
                break;
        }
    }
    return std::nullopt;
}

std::optional<Solver::State::Overload> Solver::State::nextOverload() {
    for (std::size_t rank = 0; rank < overloads.size(); ++rank)
        while (!overloads[rank].empty()) {
            auto& heap = overloads[rank];
            std::pop_heap(heap.begin(), heap.end(), isLighter);
            const Overload next = heap.back();
            heap.pop_back();
            if (const auto now = overload(next.slot);
                now && now->rank == rank && now->excess == next.excess)
                return now;
        }
    return std::nullopt;
}

std::optional<Solver::State::Overload> Solver::State::firstOverload() const {
    std::optional<Overload> first;
    for (std::size_t slot = 0; slot < tight.size(); ++slot)
        if (!first || tight[slot] < tight[first->slot])
            if (const auto found = overload(slot))
                first = found;
    return first;
}

} // namespace platform::layout
