#include "platform/ui/layout/SolverState.h"

#include <algorithm>
#include <cmath>

namespace platform::layout {

namespace {

constexpr double slopeTolerance = 1e-9;
constexpr double exchangeNoise = 1e-13;
/// A row whose value changes less than this along the way is taken as not changing.
constexpr double rateNoise = 1e-10;
/// Nearer than this, in points, is no way at all.
constexpr double shortestWay = 1e-11;
/// A leaving row's share in the row that replaces it; below, values would be found by dividing by
/// rounding errors.
constexpr double smallestShare = 1e-8;

/// How often rounding may spoil an exchange before the answer is taken as it is.
constexpr int mostFailures = 8;

} // namespace

void Solver::State::optimise() {
    applyPulls();
    checkTouchedSlots();
    idleExchanges = 0;
    // Far above what any layout needs; an answer that is not the best beats none.
    const std::size_t limit = exchanges + 1000 + 20 * tight.size();
    int failures = 0;
    while (const auto over = isCautious() ? firstOverload() : nextOverload()) {
        if (++exchanges > limit || failures > mostFailures) {
            isCutShort = true;
            needsStart = true;
            return;
        }
        const bool isDone = exchange(over->slot, over->direction);
        failures += isDone ? 0 : 1;
        if (!isDone || factor.isWorn())
            refresh();
    }
}

/// Many exchanges without getting anywhere could go round in circles. Taking always the row of the
/// smallest number, and the nearest meeting, cannot.
bool Solver::State::isCautious() const {
    return idleExchanges > 50 + tight.size() / 4;
}

/// Lets the row of the slot go to one side until another row stops the slide and takes the slot.
/// False when no row can take it; nothing has changed then.
bool Solver::State::exchange(std::size_t slot, int direction) {
    slide(slot, direction);
    findMeetings();
    const auto entering = findEntering(slot, direction);
    bool isDone = false;
    if (entering) {
        combination.clear();
        for (const auto& cell : matrix.cells(entering->row))
            combination.add(factor.slotOf(cell.variable), cell.coefficient);
        factor.combine(combination);
        const double share = direction * combination[slot];
        isDone = std::abs(share) > smallestShare &&
                 std::abs(share - entering->rate) <= 1e-6 * std::max(1.0, std::abs(share));
    }
    if (isDone) {
        for (const Row row : passed)
            setSide(row, rates[static_cast<std::size_t>(row)] > 0 ? Side::above : Side::below);
        applyPulls();
        moveBy(entering->distance);
        handOver(slot, direction, *entering);
    }
    forgetRates();
    return isDone;
}

/// How variables and loose rows change while the slot's row moves by one unit.
void Solver::State::slide(std::size_t slot, int direction) {
    slideVector.clear();
    slideVector.add(slot, direction);
    factor.move(slideVector);
    findRates();
}

void Solver::State::findRates() {
    rates.resize(rows.size(), 0);
    isRated.resize(rows.size(), false);
    slideVector.ascending([&](std::size_t slot, double rate) {
        if (rate == 0)
            return;
        matrix.forColumn(factor.variableOf(slot), [&](Row row, double coefficient) {
            const auto index = static_cast<std::size_t>(row);
            if (!isRated[index]) {
                isRated[index] = true;
                ratedRows.push_back(row);
            }
            rates[index] += coefficient * rate;
        });
    });
}

void Solver::State::forgetRates() {
    for (const Row row : ratedRows) {
        rates[static_cast<std::size_t>(row)] = 0;
        isRated[static_cast<std::size_t>(row)] = false;
    }
    ratedRows.clear();
}

/// Nearest first; of those equally near the steadiest, or in caution the one of the smallest
/// number.
auto Solver::State::laterMeeting() const {
    return [careful = isCautious()](const Meeting& a, const Meeting& b) {
        if (a.distance != b.distance)
            return a.distance > b.distance;
        const double rateA = std::abs(a.rate);
        const double rateB = std::abs(b.rate);
        return careful || rateA == rateB ? a.row > b.row : rateA < rateB;
    };
}

void Solver::State::findMeetings() {
    meetings.clear();
    passed.clear();
    for (const Row row : ratedRows) {
        const RowState& state = at(row);
        const double rate = rates[static_cast<std::size_t>(row)];
        if (state.isTight() || std::abs(rate) < rateNoise)
            continue;
        const bool isAhead =
            state.side == Side::on || (state.side == Side::above ? rate < 0 : rate > 0);
        if (!isAhead)
            continue;
        const double way = state.side == Side::on ? 0 : -state.residual / rate;
        meetings.push_back({way > shortestWay ? way : 0, rate, row});
    }
    std::make_heap(meetings.begin(), meetings.end(), laterMeeting());
}

/// The row at which sliding on would lose more than it gains.
std::optional<Solver::State::Meeting> Solver::State::findEntering(std::size_t slot, int direction) {
    const RowState& leaving = at(tight[slot]);
    const Weight& weight = direction > 0 ? leaving.above : leaving.below;
    for (std::size_t level = 0; level < levelCount(); ++level)
        slope[level] = weightAt(weight, level) - direction * forces[slot * levelCount() + level];
    std::optional<Meeting> last;
    while (!meetings.empty()) {
        std::pop_heap(meetings.begin(), meetings.end(), laterMeeting());
        const Meeting meeting = meetings.back();
        meetings.pop_back();
        if (addResistance(meeting)) {
            if (isCautious() || !isDownhill())
                return meeting;
            last = meeting;
        }
        passed.push_back(meeting.row);
    }
    // Only rounding lets a slide go on for ever: every variable resists at last.
    while (last && !passed.empty() && passed.back() != last->row)
        passed.pop_back();
    if (last)
        passed.pop_back();
    return last;
}

/// False for a row that does not mind being passed.
bool Solver::State::addResistance(const Meeting& meeting) {
    const RowState& row = at(meeting.row);
    bool resists = false;
    const auto add = [&](const Weight& weight) {
        if (weight.level < 0)
            return;
        slope[static_cast<std::size_t>(weight.level)] += weight.amount * std::abs(meeting.rate);
        slope[tieLevel()] += weight.tie * std::abs(meeting.rate);
        resists = true;
    };
    if (row.side != Side::on || meeting.rate > 0)
        add(row.above);
    if (row.side != Side::on || meeting.rate < 0)
        add(row.below);
    return resists;
}

bool Solver::State::isDownhill() const {
    for (const double part : slope)
        if (std::abs(part) > slopeTolerance)
            return part < 0;
    return false;
}

void Solver::State::moveBy(double distance) {
    idleExchanges = distance > 0 ? 0 : idleExchanges + 1;
    if (distance <= 0)
        return;
    slideVector.ascending([&](std::size_t at, double rate) {
        if (rate == 0)
            return;
        const Variable variable = factor.variableOf(at);
        variables[static_cast<std::size_t>(variable)].value += rate * distance;
        touch(variable);
    });
    for (const Row row : ratedRows)
        at(row).residual += rates[static_cast<std::size_t>(row)] * distance;
}

/// The entering row takes the slot and as much of its force as leaves the leaving row with its own
/// weight.
void Solver::State::handOver(std::size_t slot, int direction, const Meeting& entering) {
    RowState& leaver = at(tight[slot]);
    RowState& enterer = at(entering.row);
    const Weight& kept = direction > 0 ? leaver.above : leaver.below;
    const Weight& pulled = enterer.side == Side::above ? enterer.above : enterer.below;
    const double pulledSign = enterer.side == Side::on ? 0 : enterer.side == Side::above ? 1 : -1;
    const double share = combination[slot];
    for (std::size_t level = 0; level < levelCount(); ++level) {
        const double force = forces[slot * levelCount() + level];
        const double taken = (force - direction * weightAt(kept, level)) / share;
        if (std::abs(taken) > exchangeNoise)
            combination.ascending([&](std::size_t other, double part) {
                if (other != slot && part != 0)
                    changeForce(other, level, -taken * part);
            });
        const double before = pulledSign * weightAt(pulled, level);
        changeForce(slot, level, before + taken - force);
    }
    leaver.slot = RowState::noSlot;
    leaver.residual = direction * entering.distance;
    leaver.side = direction > 0 ? Side::above : Side::below;
    if (kept.level == requiredLevel)
        suspects.push_back(tight[slot]);
    enterer.slot = slot;
    enterer.side = Side::on;
    enterer.residual = 0;
    tight[slot] = entering.row;
    factor.replace(slot, combination);
    checkTouchedSlots();
}

} // namespace platform::layout
