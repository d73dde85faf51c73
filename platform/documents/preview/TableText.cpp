#include "platform/documents/preview/TableText.h"

#include <algorithm>
#include <map>

namespace platform {
namespace {

/// What stands for every sign that is none of the table's own.
constexpr char other = '\x80';
constexpr std::string_view separators = ",;\t|";
/// So many rows tell which sign separates cells.
constexpr int rowsToTellSeparator = 50;

/// How many rows have the most common count of cells, more than one; and that count.
struct Evenness {
    int rows = 0;
    std::size_t cells = 0;
    auto operator<=>(const Evenness&) const = default;
};

Evenness evennessOf(const TableText& text, std::string_view head, bool whole) {
    constexpr std::size_t mostCells = 1000;
    std::map<std::size_t, int> counts;
    std::size_t from = 0;
    for (int row = 0; row < rowsToTellSeparator && from < head.size(); ++row) {
        const std::size_t end = text.rowEnd(head, from);
        if (end == TableText::npos && row > 0 && !whole)
            break; // cut by the end of the sample
        const std::string_view bytes = head.substr(from, end == TableText::npos ? end : end - from);
        ++counts[text.cells(bytes, mostCells).size()];
        from = end == TableText::npos ? head.size() : end;
    }
    Evenness best;
    for (const auto& [cells, rows] : counts)
        if (cells > 1)
            best = std::max(best, Evenness{rows, cells});
    return best;
}

} // namespace

bool TableText::isWide() const {
    return encoding_ == TextEncoding::utf16LittleEndian ||
           encoding_ == TextEncoding::utf16BigEndian;
}

char TableText::at(std::string_view bytes, std::size_t place) const {
    if (!isWide())
        return bytes[place];
    if (place + 1 >= bytes.size())
        return other;
    const bool little = encoding_ == TextEncoding::utf16LittleEndian;
    const char low = bytes[little ? place : place + 1];
    const char high = bytes[little ? place + 1 : place];
    return high == '\0' ? low : other;
}

template<int unit>
std::size_t
TableText::walk(std::string_view bytes, std::size_t from,
                const std::function<void(std::size_t begin, std::size_t end)>* cell) const {
    // The cell begins with a quote; one is open now.
    bool quotes = false;
    bool quoted = false;
    std::size_t begin = from;
    for (std::size_t i = from; i < bytes.size(); i += unit) {
        const char sign = unit == 1 ? bytes[i] : at(bytes, i);
        if (sign == '"') {
            quotes = quotes || i == begin;
            // One within a quoted cell is written twice and so closes and opens it again.
            if (i == begin || (quotes && (quoted || at(bytes, i - unit) == '"')))
                quoted = !quoted;
        } else if (quoted) {
            continue;
        } else if (sign == separator_) {
            if (cell)
                (*cell)(begin, i);
            begin = i + unit;
            quotes = false;
        } else if (sign == '\n') {
            if (cell)
                (*cell)(begin, i);
            return i + unit;
        }
    }
    if (cell)
        (*cell)(begin, bytes.size());
    return npos;
}

std::size_t TableText::rowEnd(std::string_view bytes, std::size_t from) const {
    return isWide() ? walk<2>(bytes, from, nullptr) : walk<1>(bytes, from, nullptr);
}

std::size_t TableText::lineEnd(std::string_view bytes, std::size_t from) const {
    const std::size_t unit = isWide() ? 2 : 1;
    for (std::size_t i = from; i < bytes.size(); i += unit)
        if (at(bytes, i) == '\n')
            return i + unit;
    return npos;
}

std::vector<std::string_view> TableText::cells(std::string_view row, std::size_t most) const {
    std::vector<std::string_view> out;
    const std::function<void(std::size_t, std::size_t)> take = [&](std::size_t begin,
                                                                   std::size_t end) {
        if (out.size() < most)
            out.push_back(row.substr(begin, end - begin));
    };
    isWide() ? walk<2>(row, 0, &take) : walk<1>(row, 0, &take);
    return out;
}

TableText TableText::detect(std::string_view head, bool whole, TextEncoding encoding) {
    TableText best(encoding, ',');
    const std::size_t unit = best.isWide() ? 2 : 1;
    if (head.size() > 5 * unit && best.at(head, 0) == 's' && best.at(head, unit) == 'e' &&
        best.at(head, 2 * unit) == 'p' && best.at(head, 3 * unit) == '=')
        return {encoding, best.at(head, 4 * unit)};
    Evenness found;
    for (const char separator : separators) {
        const TableText text(encoding, separator);
        const Evenness evenness = evennessOf(text, head, whole);
        if (evenness > found) {
            found = evenness;
            best = text;
        }
    }
    return best;
}

QString TableText::meaning(QString cell) {
    constexpr QChar lineFeed(0x240A);
    constexpr QChar carriageReturn(0x240D);
    if (cell.startsWith(u'"')) {
        QString inner;
        inner.reserve(cell.size());
        bool quoted = true;
        for (qsizetype i = 1; i < cell.size(); ++i) {
            const bool quote = quoted && cell[i] == u'"';
            if (quote && i + 1 < cell.size() && cell[i + 1] == u'"')
                inner += cell[i++];
            else if (quote)
                quoted = false;
            else
                inner += cell[i];
        }
        cell = std::move(inner);
    }
    cell.remove(carriageReturn);
    return cell.replace(lineFeed, QChar(0x21B5));
}

bool isNumberText(const QString& text) {
    bool figures = false;
    for (const QChar unit : text) {
        if (unit.isDigit())
            figures = true;
        else if (!QStringView(u"+-−.,:/%'()€$£¥ \u00A0\u202F").contains(unit))
            return false;
    }
    return figures;
}

} // namespace platform
