#pragma once

#include "platform/documents/preview/TableFile.h"
#include "platform/documents/preview/ZoomWidget.h"

#include <QFont>

#include <functional>
#include <map>
#include <optional>
#include <vector>

namespace platform {

/// What is known of a table before all of its rows are: from the first of them.
struct TableShape {
    struct Column {
        /// "" when the table has no names.
        QString name;
        double width = 0;
        /// Its cells are numbers for the most part.
        bool numbers = false;
    };
    std::vector<Column> columns;
    /// The first row names the columns.
    bool named = false;

    /// `first`: one of the rows may name the columns.
    static TableShape of(const std::vector<TableRow>& rows, bool first);
};

/// Draws the part of a table that is in view, with the names of the columns above it and the
/// numbers of the rows beside it, and asks for the rows that it needs.
class TableContent final : public ZoomContent {
public:
    static constexpr std::size_t rowsABlock = 128;
    /// Asks for blocks of rows, by their numbers, the most urgent first; the earlier wishes are
    /// void.
    using Wish = std::function<void(std::vector<std::uint64_t> blocks)>;

    TableContent(Wish wish, bool rightToLeft);

    /// Begins anew.
    void set(TableShape shape, std::uint64_t rowCount);
    void setRowCount(std::uint64_t rowCount);
    /// Columns become as wide as those rows need, but never narrower: answers whether one did.
    bool setBlock(std::uint64_t block, std::vector<TableRow> rows, const TableShape& shape);
    std::uint64_t rowCount() const { return rowCount_; }

    struct Cell {
        std::uint64_t row;
        std::size_t column;
        bool operator==(const Cell&) const = default;
    };
    /// The cell at a place of the content while that part of it is in view; none beside them.
    std::optional<Cell> cellAt(QPointF place, const QRectF& visible) const;
    void select(std::optional<Cell> cell) { selected_ = cell; }
    std::optional<Cell> selected() const { return selected_; }
    QString textOf(const Cell& cell) const;

    QSizeF contentSize() const override;
    void paintContent(QPainter& painter, const QRectF& visible, double zoom) override;

private:
    struct Frame;

    double numbersWidth() const;
    double headHeight() const;
    double lineHeight() const;
    /// The rows that are drawn below the head.
    std::uint64_t bodyRows() const { return rowCount_ - (shape_.named && rowCount_ > 0 ? 1 : 0); }
    std::uint64_t firstBodyRow() const { return shape_.named ? 1 : 0; }
    std::size_t columnAt(double x) const;
    bool widen(const TableShape& shape);
    void arrange();
    const TableRow* row(std::uint64_t number) const;
    void ask(const Frame& frame);
    /// In the view: what is so far from the side where reading begins, and from the view's top.
    QRectF placed(const Frame& frame, double start, double top, double width, double height) const;
    void paintRow(QPainter& painter, const Frame& frame, std::uint64_t index) const;
    void paintHead(QPainter& painter, const Frame& frame) const;
    void paintNumbers(QPainter& painter, const Frame& frame) const;
    void paintText(QPainter& painter, const QString& text, const QRectF& cell, bool trailing) const;

    Wish wish_;
    const bool rightToLeft_;
    TableShape shape_;
    /// Where columns begin, and the end of the last; measured from the side where reading begins.
    std::vector<double> starts_{0};
    std::uint64_t rowCount_ = 0;
    std::map<std::uint64_t, std::vector<TableRow>> blocks_;
    std::vector<std::uint64_t> asked_;
    std::optional<Cell> selected_;
    QFont font_;
    QFont headFont_;
};

} // namespace platform
