#include "platform/ui/layout/BasisElimination.h"

#include <algorithm>
#include <cmath>

namespace platform::layout {

namespace {

/// Below this a coefficient is the noise of cancelled terms.
constexpr double smallestPivot = 1e-9;
/// How much smaller than the largest of its column a pivot may be.
constexpr double pivotShare = 0.05;

} // namespace

BasisFactor::Elimination::Elimination(const SparseRows& matrix, std::span<const Row> rows)
    : size(rows.size()),
      matrix_(matrix),
      rows_(rows),
      lineStarts_(size + 1, 0),
      openInColumn_(size),
      openInLine_(size, 0),
      columnTaken_(size, false),
      variableTaken_(size, false) {
    columnOfPivot.reserve(size);
    variableOfPivot.reserve(size);
    pivots.reserve(size);
    for (std::size_t c = 0; c < size; ++c) {
        openInColumn_[c] = column(c).size();
        for (const auto& cell : column(c))
            ++openInLine_[static_cast<std::size_t>(cell.variable)];
    }
    for (std::size_t v = 0; v < size; ++v)
        lineStarts_[v + 1] = lineStarts_[v] + openInLine_[v];
    lines_.resize(lineStarts_[size]);
    std::vector<std::size_t> next(lineStarts_.begin(), lineStarts_.end() - 1);
    for (std::size_t c = 0; c < size; ++c)
        for (const auto& cell : column(c))
            lines_[next[static_cast<std::size_t>(cell.variable)]++] = c;
}

double BasisFactor::Elimination::coefficient(std::size_t index, std::size_t variable) const {
    for (const auto& cell : column(index))
        if (static_cast<std::size_t>(cell.variable) == variable)
            return cell.coefficient;
    return 0;
}

void BasisFactor::Elimination::take(std::size_t index, std::size_t variable, double pivot) {
    columnOfPivot.push_back(index);
    variableOfPivot.push_back(variable);
    pivots.push_back(pivot);
    columnTaken_[index] = true;
    variableTaken_[variable] = true;
}

void BasisFactor::Elimination::peelColumns() {
    std::vector<std::size_t> ready;
    for (std::size_t c = 0; c < size; ++c)
        if (openInColumn_[c] == 1)
            ready.push_back(c);
    for (std::size_t i = 0; i < ready.size(); ++i) {
        const std::size_t index = ready[i];
        if (columnTaken_[index] || openInColumn_[index] != 1)
            continue;
        const auto cells = column(index);
        const auto open = std::find_if(cells.begin(), cells.end(), [this](const auto& cell) {
            return !variableTaken_[static_cast<std::size_t>(cell.variable)];
        });
        if (std::abs(open->coefficient) < smallestPivot)
            continue;
        const auto variable = static_cast<std::size_t>(open->variable);
        const std::size_t pivot = pivots.size();
        take(index, variable, open->coefficient);
        for (const std::size_t other : columnsWith(variable)) {
            if (columnTaken_[other])
                continue;
            upper.push_back({pivot, other, coefficient(other, variable)});
            if (--openInColumn_[other] == 1)
                ready.push_back(other);
        }
    }
}

void BasisFactor::Elimination::peelLines() {
    std::vector<std::size_t> ready;
    for (std::size_t v = 0; v < size; ++v) {
        openInLine_[v] = 0;
        if (variableTaken_[v])
            continue;
        for (const std::size_t c : columnsWith(v))
            openInLine_[v] += columnTaken_[c] ? 0 : 1;
        if (openInLine_[v] == 1)
            ready.push_back(v);
    }
    for (std::size_t i = 0; i < ready.size(); ++i) {
        const std::size_t variable = ready[i];
        if (variableTaken_[variable] || openInLine_[variable] != 1)
            continue;
        const auto columns = columnsWith(variable);
        const std::size_t index = *std::find_if(columns.begin(), columns.end(),
                                                [this](std::size_t c) { return !columnTaken_[c]; });
        const double value = coefficient(index, variable);
        double largest = 0;
        for (const auto& cell : column(index))
            if (!variableTaken_[static_cast<std::size_t>(cell.variable)])
                largest = std::max(largest, std::abs(cell.coefficient));
        if (std::abs(value) < std::max(smallestPivot, pivotShare * largest))
            continue;
        const std::size_t pivot = pivots.size();
        take(index, variable, value);
        for (const auto& cell : column(index)) {
            const auto other = static_cast<std::size_t>(cell.variable);
            if (variableTaken_[other])
                continue;
            lower.push_back({pivot, other, cell.coefficient / value});
            if (--openInLine_[other] == 1)
                ready.push_back(other);
        }
    }
}

void BasisFactor::Elimination::openRest() {
    rest_.resize(size);
    restLines_.resize(size);
    scratch_.assign(size, 0);
    for (std::size_t c = 0; c < size; ++c) {
        if (columnTaken_[c])
            continue;
        rest_[c].open = true;
        for (const auto& cell : column(c)) {
            const auto variable = static_cast<std::size_t>(cell.variable);
            if (variableTaken_[variable])
                continue;
            rest_[c].cells.push_back({variable, cell.coefficient});
            restLines_[variable].push_back(c);
        }
        enqueue(c);
    }
}

void BasisFactor::Elimination::enqueue(std::size_t index) {
    const std::size_t count = rest_[index].cells.size();
    if (queues_.size() <= count)
        queues_.resize(count + 1);
    queues_[count].push_back(index);
}

std::size_t BasisFactor::Elimination::nextColumn() {
    for (std::size_t count = 0; count < queues_.size(); ++count)
        while (!queues_[count].empty()) {
            const std::size_t index = queues_[count].back();
            queues_[count].pop_back();
            if (rest_[index].open && rest_[index].cells.size() == count)
                return index;
        }
    return none;
}

std::size_t BasisFactor::Elimination::choosePivot(std::size_t index) const {
    double largest = 0;
    for (const Entry& cell : rest_[index].cells)
        largest = std::max(largest, std::abs(cell.value));
    if (largest < smallestPivot)
        return none;
    std::size_t best = none;
    for (const Entry& cell : rest_[index].cells)
        if (std::abs(cell.value) >= pivotShare * largest &&
            (best == none || restLines_[cell.index].size() < restLines_[best].size()))
            best = cell.index;
    return best;
}

void BasisFactor::Elimination::subtract(std::size_t index, std::size_t variable) {
    // scratch_ holds the lower factor of the pivot's column.
    auto& cells = rest_[index].cells;
    const auto at = std::find_if(cells.begin(), cells.end(),
                                 [&](const Entry& cell) { return cell.index == variable; });
    if (at == cells.end())
        return;
    const std::size_t pivot = pivots.size() - 1;
    const double share = at->value;
    upper.push_back({pivot, index, share});
    cells.erase(at);
    for (Entry& cell : cells) {
        cell.value -= scratch_[cell.index] * share;
        scratch_[cell.index] = 0;
    }
    for (std::size_t i = lower.size(); i-- > 0 && lower[i].pivot == pivot;) {
        const std::size_t other = lower[i].other;
        if (scratch_[other] != 0) {
            cells.push_back({other, -scratch_[other] * share});
            restLines_[other].push_back(index);
        }
        scratch_[other] = lower[i].value;
    }
    std::erase_if(cells, [](const Entry& cell) { return std::abs(cell.value) < smallestPivot; });
    enqueue(index);
}

void BasisFactor::Elimination::close(std::size_t index) {
    rest_[index].open = false;
    rest_[index].cells.clear();
}

void BasisFactor::Elimination::eliminateRest() {
    if (pivots.size() == size)
        return;
    openRest();
    for (std::size_t index = nextColumn(); index != none; index = nextColumn()) {
        const std::size_t variable = choosePivot(index);
        if (variable == none) {
            close(index);
            continue;
        }
        const auto& cells = rest_[index].cells;
        const double pivot = std::find_if(cells.begin(), cells.end(), [&](const Entry& cell) {
                                 return cell.index == variable;
                             })->value;
        take(index, variable, pivot);
        for (const Entry& cell : cells)
            if (cell.index != variable) {
                lower.push_back({pivots.size() - 1, cell.index, cell.value / pivot});
                scratch_[cell.index] = cell.value / pivot;
            }
        close(index);
        for (const std::size_t other : restLines_[variable])
            if (rest_[other].open)
                subtract(other, variable);
        for (std::size_t i = lower.size(); i-- > 0 && lower[i].pivot == pivots.size() - 1;)
            scratch_[lower[i].other] = 0;
    }
}

void BasisFactor::Elimination::repair(std::vector<Repair>& repairs) {
    std::size_t variable = 0;
    for (std::size_t c = 0; c < size; ++c) {
        if (columnTaken_[c])
            continue;
        while (variableTaken_[variable])
            ++variable;
        repairs.push_back({pivots.size(), static_cast<Variable>(variable)});
        std::erase_if(upper, [c](const Factor& factor) { return factor.other == c; });
        take(c, variable, 1);
    }
}

} // namespace platform::layout
