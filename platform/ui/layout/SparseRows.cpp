#include "platform/ui/layout/SparseRows.h"

namespace platform::layout {

std::size_t SparseRows::room(std::size_t count) {
    if (count < freeCells_.size() && !freeCells_[count].empty()) {
        const std::size_t begin = freeCells_[count].back();
        freeCells_[count].pop_back();
        return begin;
    }
    const std::size_t begin = cells_.size();
    cells_.resize(begin + count);
    return begin;
}

Row SparseRows::add(std::span<const Term> terms) {
    if (freeRows_.empty()) {
        freeRows_.push_back(static_cast<Row>(extents_.size()));
        extents_.emplace_back();
    }
    const Row row = freeRows_.back();
    freeRows_.pop_back();
    const Extent extent{room(terms.size()), terms.size()};
    extents_[static_cast<std::size_t>(row)] = extent;
    for (std::size_t i = 0; i < terms.size(); ++i) {
        const auto at = static_cast<std::int32_t>(extent.begin + i);
        std::int32_t& first = heads_[static_cast<std::size_t>(terms[i].variable)];
        cells_[extent.begin + i] = {terms[i].variable, row, terms[i].coefficient, first, none};
        if (first != none)
            cells_[static_cast<std::size_t>(first)].previous = at;
        first = at;
    }
    return row;
}

void SparseRows::remove(Row row) {
    Extent& extent = extents_[static_cast<std::size_t>(row)];
    for (const Cell& cell : cells(row)) {
        if (cell.previous != none)
            cells_[static_cast<std::size_t>(cell.previous)].next = cell.next;
        else
            heads_[static_cast<std::size_t>(cell.variable)] = cell.next;
        if (cell.next != none)
            cells_[static_cast<std::size_t>(cell.next)].previous = cell.previous;
    }
    if (extent.count > 0) {
        if (freeCells_.size() <= extent.count)
            freeCells_.resize(extent.count + 1);
        freeCells_[extent.count].push_back(extent.begin);
    }
    extent = {};
    freeRows_.push_back(row);
}

} // namespace platform::layout
