#include "platform/documents/preview/TableFile.h"

#include <algorithm>
#include <utility>

namespace platform {
namespace {

constexpr std::size_t sampleSize = 64UL * 1024;
constexpr std::size_t windowSize = 1024UL * 1024;
/// Counted in one go: some hundredths of a second.
constexpr std::uint64_t countedAtOnce = 4ULL * 1024 * 1024;
/// A row that is longer has an open quote that nobody closed: it ends with its line, or here. Even.
constexpr std::size_t longestRow = 256UL * 1024;
/// Of a cell; nobody reads a book in one. Even.
constexpr std::size_t longestCell = 4UL * 1024;
/// A place is kept for the first of so many rows.
constexpr std::uint64_t rowsAPlace = 256;

} // namespace

Result<TableFile> TableFile::open(const Url& file, const std::string& path) {
    Result<TextFile> text = TextFile::open(file, path);
    if (!text)
        return text.error();
    const std::string head = text->read(text->start(), sampleSize);
    const TableText format = TableText::detect(head, head.size() < sampleSize, text->encoding());
    std::uint64_t first = text->start();
    // A line that only tells the separator is no row.
    const std::size_t line = format.lineEnd(head, 0);
    if (line != TableText::npos &&
        text->decode(std::string_view(head).substr(0, line)) ==
            QStringLiteral("sep=%1").arg(QLatin1Char(format.separator())))
        first += line;
    TableFile table(std::move(*text), format);
    table.counted_ = first;
    table.countMore();
    return table;
}

std::size_t TableFile::boundedRowEnd(std::string_view bytes, std::size_t from, bool toEnd) const {
    std::size_t end =
        format_.rowEnd(bytes.substr(0, from + std::min(longestRow, bytes.size() - from)), from);
    if (end != TableText::npos)
        return end;
    if (bytes.size() - from < longestRow)
        return toEnd ? bytes.size() : TableText::npos;
    end = format_.lineEnd(bytes.substr(0, from + longestRow), from);
    return end == TableText::npos ? from + longestRow : end;
}

void TableFile::eachRow(
    std::uint64_t offset,
    const std::function<bool(std::uint64_t end, std::string_view row)>& take) const {
    while (offset < text_.size()) {
        const std::string bytes = text_.read(offset, windowSize);
        const bool toEnd = offset + bytes.size() >= text_.size();
        std::size_t at = 0;
        while (at < bytes.size()) {
            const std::size_t end = boundedRowEnd(bytes, at, toEnd);
            if (end == TableText::npos)
                break; // the rest of the row is in the next window
            if (!take(offset + end, std::string_view(bytes).substr(at, end - at)))
                return;
            at = end;
        }
        if (at == 0)
            return; // a disk that gives no more
        offset += at;
    }
}

void TableFile::countMore() {
    const std::uint64_t enough = counted_ + countedAtOnce;
    const std::uint64_t before = counted_;
    eachRow(counted_, [&](std::uint64_t end, std::string_view /*row*/) {
        if (rowCount_ % rowsAPlace == 0)
            places_.push_back(counted_);
        ++rowCount_;
        counted_ = end;
        return counted_ < enough;
    });
    if (counted_ == before)
        counted_ = text_.size();
}

TableRow TableFile::cellsOf(std::string_view row) const {
    TableRow cells;
    for (std::string_view cell : format_.cells(row, mostColumns + 1)) {
        if (cells.size() == mostColumns) {
            cells.push_back(QStringLiteral("…"));
            break;
        }
        const bool cut = cell.size() > longestCell;
        QString text = TableText::meaning(text_.decode(cell.substr(0, longestCell)));
        cells.push_back(cut ? text + u'…' : std::move(text));
    }
    return cells;
}

std::vector<TableRow> TableFile::rows(std::uint64_t first, std::size_t count) const {
    std::vector<TableRow> out;
    const std::uint64_t end = std::min(rowCount_, first + count);
    if (first >= end)
        return out;
    std::uint64_t row = first - first % rowsAPlace;
    eachRow(places_[row / rowsAPlace], [&](std::uint64_t /*end*/, std::string_view bytes) {
        if (row >= first)
            out.push_back(cellsOf(bytes));
        return ++row < end;
    });
    return out;
}

} // namespace platform
