#pragma once

#include <cstdint>
#include <span>
#include <vector>

namespace platform::layout {

/// Numbers of a solver's unknowns and of its rows; given out small and used again.
using Variable = std::int32_t;
using Row = std::int32_t;

struct Term {
    Variable variable;
    double coefficient;
};

/// A sparse matrix that is walked by rows and by columns and changes all the time. A row's terms
/// stand together; a column is a list through them.
class SparseRows {
public:
    struct Cell {
        Variable variable;
        Row row;
        double coefficient;
        std::int32_t next;
        std::int32_t previous;
    };

    void addVariable() { heads_.push_back(none); }
    std::size_t variableCount() const { return heads_.size(); }
    std::size_t rowCount() const { return extents_.size(); }

    /// Each variable at most once, no coefficient zero.
    Row add(std::span<const Term> terms);
    void remove(Row row);

    std::span<const Cell> cells(Row row) const {
        const Extent& extent = extents_[static_cast<std::size_t>(row)];
        return {cells_.data() + extent.begin, extent.count};
    }
    template<class Visit>
    void forColumn(Variable variable, Visit visit) const {
        for (std::int32_t at = head(variable); at != none;) {
            const Cell& cell = cells_[static_cast<std::size_t>(at)];
            at = cell.next;
            visit(cell.row, cell.coefficient);
        }
    }

private:
    static constexpr std::int32_t none = -1;
    struct Extent {
        std::size_t begin = 0;
        std::size_t count = 0;
    };

    std::int32_t head(Variable variable) const {
        return heads_[static_cast<std::size_t>(variable)];
    }
    std::size_t room(std::size_t count);

    std::vector<Cell> cells_;
    std::vector<std::int32_t> heads_;
    std::vector<Extent> extents_;
    std::vector<Row> freeRows_;
    /// Where removed rows of a given length stood.
    std::vector<std::vector<std::size_t>> freeCells_;
};

} // namespace platform::layout
