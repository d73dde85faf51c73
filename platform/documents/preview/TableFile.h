#pragma once

#include "platform/documents/preview/TableText.h"

#include <cstdint>
#include <optional>
#include <vector>

namespace platform {

/// The cells of one row; as many as it has.
using TableRow = std::vector<QString>;

/// An open file of rows and cells, of any length: read by windows, its rows counted bit by bit.
/// Belongs to one queue.
class TableFile {
public:
    /// A row shows no more cells; more than that nobody leafs through.
    static constexpr std::size_t mostColumns = 500;

    static Result<TableFile> open(const Url& file, const std::string& path);

    /// Goes on counting rows, for a few milliseconds.
    void countMore();
    bool isCounted() const { return counted_ >= text_.size(); }
    /// Of what is counted.
    std::uint64_t rowCount() const { return rowCount_; }
    /// The rows from that one on, of what is counted: at most that many.
    std::vector<TableRow> rows(std::uint64_t first, std::size_t count) const;

private:
    explicit TableFile(TextFile text, TableText format) : text_(std::move(text)), format_(format) {}
    /// Behind the row at `from` of bytes that reach to the end of the file or far enough.
    std::size_t boundedRowEnd(std::string_view bytes, std::size_t from, bool toEnd) const;
    /// Calls for each row from that place of the file on, until it answers false.
    void eachRow(std::uint64_t offset,
                 const std::function<bool(std::uint64_t end, std::string_view row)>& take) const;
    TableRow cellsOf(std::string_view row) const;

    TextFile text_;
    TableText format_;
    /// Where every so-many-th row begins.
    std::vector<std::uint64_t> places_;
    std::uint64_t counted_ = 0;
    std::uint64_t rowCount_ = 0;
};

} // namespace platform
