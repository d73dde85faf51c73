#pragma once

#include "platform/ui/layout/BasisFactor.h"

namespace platform::layout {

/// Chooses the order in which factor() takes rows and variables, and computes the factors. Layout
/// is nearly triangular: most rows determine one more variable from those before it and need no
/// arithmetic. What is left (equal shares, centring) is eliminated in the order of fewest entries.
///
/// The matrix here has a column for every tight row and a line for every variable.
struct BasisFactor::Elimination {
    struct Factor {
        std::size_t pivot;
        /// Lower factor: a variable. Upper factor: a column.
        std::size_t other;
        double value;
    };
    static constexpr std::size_t none = static_cast<std::size_t>(-1);

    Elimination(const SparseRows& matrix, std::span<const Row> rows);

    /// Columns that hold one open variable only.
    void peelColumns();
    /// Variables that stand in one open column only.
    void peelLines();
    void eliminateRest();
    /// Gives every variable that no column could take a row of its own.
    void repair(std::vector<Repair>& repairs);

    std::size_t size;
    std::vector<std::size_t> columnOfPivot;
    std::vector<std::size_t> variableOfPivot;
    std::vector<double> pivots;
    std::vector<Factor> lower;
    std::vector<Factor> upper;

private:
    /// A column of the rest, shrinking and growing as others are subtracted from it.
    struct OpenColumn {
        std::vector<Entry> cells;
        bool open = false;
    };

    std::span<const SparseRows::Cell> column(std::size_t index) const {
        return matrix_.cells(rows_[index]);
    }
    std::span<const std::size_t> columnsWith(std::size_t variable) const {
        return {lines_.data() + lineStarts_[variable],
                lineStarts_[variable + 1] - lineStarts_[variable]};
    }
    double coefficient(std::size_t column, std::size_t variable) const;
    void take(std::size_t column, std::size_t variable, double pivot);

    void openRest();
    void enqueue(std::size_t column);
    std::size_t nextColumn();
    std::size_t choosePivot(std::size_t column) const;
    void subtract(std::size_t column, std::size_t variable);
    void close(std::size_t column);

    const SparseRows& matrix_;
    std::span<const Row> rows_;
    std::vector<std::size_t> lineStarts_;
    std::vector<std::size_t> lines_;
    std::vector<std::size_t> openInColumn_;
    std::vector<std::size_t> openInLine_;
    std::vector<bool> columnTaken_;
    std::vector<bool> variableTaken_;

    std::vector<OpenColumn> rest_;
    /// For each variable of the rest, the columns that have held it; some no longer do.
    std::vector<std::vector<std::size_t>> restLines_;
    /// Columns of the rest by their number of cells; entries go stale and are checked when met.
    std::vector<std::vector<std::size_t>> queues_;
    std::vector<double> scratch_;
};

} // namespace platform::layout
