#include "platform/documents/preview/TableContent.h"

#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"

#include <QFontMetricsF>
#include <QPainter>

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

constexpr double cellMargin = 10;
/// The last rows can be drawn above the buttons that float over the table.
constexpr double roomBelow = 112;
constexpr double narrowestColumn = 48;
/// A longer text is cut; a touch on the cell shows it whole.
constexpr double widestColumn = 260;
/// In place of the rows that were dropped, others are read again.
constexpr std::size_t mostBlocks = 32;
/// More letters are never drawn in a column, and cost time when they are measured.
constexpr qsizetype mostLetters = 80;

QFont cellFont() {
    return toQt(Font::preferred(TextStyle::footnote));
}

QFont nameFont() {
    QFont font = cellFont();
    font.setWeight(QFont::DemiBold);
    return font;
}

/// A, B … Z, AA, AB and so on.
QString letters(std::size_t column) {
    QString name;
    for (std::size_t rest = column + 1; rest > 0; rest = (rest - 1) / 26)
        name.prepend(QChar(static_cast<char16_t>(u'A' + (rest - 1) % 26)));
    return name;
}

/// A first row without figures and without gaps, above others, is one of names.
bool hasNames(const std::vector<TableRow>& rows) {
    return rows.size() > 1 && std::all_of(rows[0].begin(), rows[0].end(), [](const QString& cell) {
               return !cell.trimmed().isEmpty() && !isNumberText(cell);
           });
}

} // namespace

TableShape TableShape::of(const std::vector<TableRow>& rows, bool first) {
    TableShape shape;
    shape.named = first && hasNames(rows);
    const QFontMetricsF cells(cellFont());
    const QFontMetricsF names(nameFont());
    std::vector<int> filled;
    std::vector<int> numbers;
    for (std::size_t row = 0; row < rows.size(); ++row) {
        const bool head = shape.named && row == 0;
        if (rows[row].size() > shape.columns.size()) {
            shape.columns.resize(rows[row].size());
            filled.resize(rows[row].size());
            numbers.resize(rows[row].size());
        }
        for (std::size_t i = 0; i < rows[row].size(); ++i) {
            const QString& text = rows[row][i];
            const double width =
                (head ? names : cells).horizontalAdvance(text.left(mostLetters)) + 2 * cellMargin;
            Column& column = shape.columns[i];
            column.width =
                std::clamp(std::max(column.width, std::ceil(width)), narrowestColumn, widestColumn);
            if (head) {
                column.name = text;
            } else if (!text.isEmpty()) {
                ++filled[i];
                numbers[i] += isNumberText(text) ? 1 : 0;
            }
        }
    }
    for (std::size_t i = 0; i < shape.columns.size(); ++i)
        shape.columns[i].numbers = filled[i] > 0 && numbers[i] * 5 >= filled[i] * 4;
    return shape;
}

/// What one picture shows; places are counted from the corner where reading begins.
struct TableContent::Frame {
    /// Of the content.
    QRectF visible;
    double numbers;
    double head;
    double line;
    std::uint64_t firstRow;
    std::uint64_t endRow;
    std::size_t firstColumn;
    std::size_t endColumn;
    double pixel;
};

TableContent::TableContent(Wish wish, bool rightToLeft)
    : wish_(std::move(wish)), rightToLeft_(rightToLeft), font_(cellFont()), headFont_(nameFont()) {
}

void TableContent::set(TableShape shape, std::uint64_t rowCount) {
    shape_ = std::move(shape);
    arrange();
    blocks_.clear();
    asked_.clear();
    selected_.reset();
    rowCount_ = rowCount;
}

void TableContent::arrange() {
    starts_.assign(1, 0);
    for (const TableShape::Column& column : shape_.columns)
        starts_.push_back(starts_.back() + column.width);
}

bool TableContent::widen(const TableShape& shape) {
    bool wider = shape.columns.size() > shape_.columns.size();
    if (wider)
        shape_.columns.resize(shape.columns.size());
    for (std::size_t i = 0; i < shape.columns.size(); ++i)
        if (shape.columns[i].width > shape_.columns[i].width) {
            shape_.columns[i].width = shape.columns[i].width;
            wider = true;
        }
    if (wider)
        arrange();
    return wider;
}

void TableContent::setRowCount(std::uint64_t rowCount) {
    // What was the last block may have been cut.
    blocks_.erase(rowCount_ / rowsABlock);
    asked_.clear();
    rowCount_ = rowCount;
}

bool TableContent::setBlock(std::uint64_t block, std::vector<TableRow> rows,
                            const TableShape& shape) {
    blocks_[block] = std::move(rows);
    while (blocks_.size() > mostBlocks) {
        // The one that is farthest away.
        const auto first = blocks_.begin();
        const auto last = std::prev(blocks_.end());
        blocks_.erase(block - first->first > last->first - block ? first : last);
    }
    return widen(shape);
}

double TableContent::lineHeight() const {
    return std::round(QFontMetricsF(font_).height() * 1.3 + 10);
}

double TableContent::headHeight() const {
    return lineHeight() + 4;
}

double TableContent::numbersWidth() const {
    const auto figures = std::max<std::size_t>(2, std::to_string(rowCount_).size());
    return std::ceil(static_cast<double>(figures) *
                         QFontMetricsF(font_).horizontalAdvance(QLatin1Char('0')) +
                     2 * cellMargin);
}

QSizeF TableContent::contentSize() const {
    return {numbersWidth() + starts_.back(),
            headHeight() + static_cast<double>(bodyRows()) * lineHeight() + roomBelow};
}

const TableRow* TableContent::row(std::uint64_t number) const {
    const auto block = blocks_.find(number / rowsABlock);
    if (block == blocks_.end() || block->second.size() <= number % rowsABlock)
        return nullptr;
    return &block->second[number % rowsABlock];
}

std::size_t TableContent::columnAt(double x) const {
    const auto behind = std::upper_bound(starts_.begin(), starts_.end(), x);
    const auto index = static_cast<std::size_t>(behind - starts_.begin());
    return std::min(index == 0 ? 0 : index - 1, shape_.columns.size());
}

std::optional<TableContent::Cell> TableContent::cellAt(QPointF place, const QRectF& visible) const {
    if (place.y() < visible.top() + headHeight() || !visible.contains(place))
        return std::nullopt;
    const double x = rightToLeft_ ? contentSize().width() - place.x() : place.x();
    const double start = rightToLeft_ ? contentSize().width() - visible.right() : visible.left();
    if (x < start + numbersWidth())
        return std::nullopt;
    const Cell cell{firstBodyRow() +
                        static_cast<std::uint64_t>((place.y() - headHeight()) / lineHeight()),
                    columnAt(x - numbersWidth())};
    if (cell.row >= rowCount_ || cell.column >= shape_.columns.size())
        return std::nullopt;
    return cell;
}

QString TableContent::textOf(const Cell& cell) const {
    const TableRow* const cells = row(cell.row);
    return cells && cell.column < cells->size() ? (*cells)[cell.column] : QString();
}

void TableContent::ask(const Frame& frame) {
    std::vector<std::uint64_t> wanted;
    const std::uint64_t first = (firstBodyRow() + frame.firstRow) / rowsABlock;
    const std::uint64_t last =
        (firstBodyRow() + std::max(frame.endRow, std::uint64_t{1}) - 1) / rowsABlock;
    for (std::uint64_t block = first; block <= last; ++block)
        wanted.push_back(block);
    // Those next to what is in view will be wanted soon.
    wanted.push_back(last + 1);
    if (first > 0)
        wanted.push_back(first - 1);
    std::erase_if(wanted, [&](std::uint64_t block) {
        return blocks_.contains(block) || block * rowsABlock >= rowCount_;
    });
    if (wanted == asked_)
        return;
    asked_ = wanted;
    wish_(std::move(wanted));
}

void TableContent::paintContent(QPainter& painter, const QRectF& visible, double zoom) {
    if (shape_.columns.empty() || visible.isEmpty())
        return;
    Frame frame{visible, numbersWidth(), headHeight(), lineHeight(), 0, 0, 0, 0, 1 / zoom};
    const double start = rightToLeft_ ? contentSize().width() - visible.right() : visible.left();
    frame.firstRow = static_cast<std::uint64_t>(std::max(0.0, visible.top() / frame.line));
    frame.endRow = std::min(
        bodyRows(), frame.firstRow + static_cast<std::uint64_t>(visible.height() / frame.line) + 2);
    frame.firstColumn = columnAt(start);
    frame.endColumn = std::min(shape_.columns.size(), columnAt(start + visible.width()) + 1);
    ask(frame);
    // In small figures: coordinates of millions of rows have no room for fractions.
    painter.translate(visible.topLeft());
    painter.setClipRect(QRectF(QPointF(), visible.size()));
    painter.fillRect(QRectF(QPointF(), visible.size()), toQt(Theme::page));
    painter.setFont(font_);
    for (std::uint64_t index = frame.firstRow; index < frame.endRow; ++index)
        paintRow(painter, frame, index);
    paintNumbers(painter, frame);
    paintHead(painter, frame);
}

void TableContent::paintText(QPainter& painter, const QString& text, const QRectF& cell,
                             bool trailing) const {
    const QFontMetricsF metrics(painter.font());
    const QRectF room = cell.adjusted(cellMargin, 0, -cellMargin, 0);
    const QString shown =
        text.size() > mostLetters || metrics.horizontalAdvance(text) > room.width() + 0.5
            ? metrics.elidedText(text.left(4 * mostLetters), Qt::ElideRight, room.width())
            : text;
    const bool right = trailing != rightToLeft_;
    painter.drawText(room,
                     (right ? Qt::AlignRight : Qt::AlignLeft) | Qt::AlignVCenter |
                         Qt::AlignAbsolute | Qt::TextSingleLine | Qt::TextDontClip,
                     shown);
}

QRectF TableContent::placed(const Frame& frame, double start, double top, double width,
                            double height) const {
    const double x = rightToLeft_ ? contentSize().width() - start - width : start;
    return {x - frame.visible.left(), top, width, height};
}

void TableContent::paintRow(QPainter& painter, const Frame& frame, std::uint64_t index) const {
    const std::uint64_t number = firstBodyRow() + index;
    const TableRow* const cells = row(number);
    const double top = frame.head + static_cast<double>(index) * frame.line - frame.visible.top();
    for (std::size_t i = frame.firstColumn; i < frame.endColumn; ++i) {
        const QRectF cell =
            placed(frame, frame.numbers + starts_[i], top, shape_.columns[i].width, frame.line);
        if (selected_ == Cell{number, i})
            painter.fillRect(cell, toQt(Theme::selection));
        // Not there yet: a bar in place of the text, as lists have it.
        if (!cells) {
            painter.fillRect(cell.adjusted(cellMargin, cell.height() / 2 - 3, -cellMargin * 2,
                                           3 - cell.height() / 2),
                             toQt(Theme::hairline.withAlpha(0.5)));
            continue;
        }
        painter.setPen(toQt(Theme::text));
        if (i < cells->size() && !(*cells)[i].isEmpty())
            paintText(painter, (*cells)[i], cell, shape_.columns[i].numbers);
    }
    const QRectF whole = placed(frame, 0, top, contentSize().width(), frame.line);
    painter.fillRect(QRectF(whole.left(), whole.bottom() - frame.pixel, whole.width(), frame.pixel),
                     toQt(Theme::hairline.withAlpha(0.6)));
}

void TableContent::paintNumbers(QPainter& painter, const Frame& frame) const {
    const double width = frame.visible.width();
    const double left = rightToLeft_ ? width - frame.numbers : 0;
    painter.fillRect(QRectF(left, 0, frame.numbers, frame.visible.height()), toQt(Theme::bar));
    painter.fillRect(QRectF(rightToLeft_ ? left : left + frame.numbers - frame.pixel, 0,
                            frame.pixel, frame.visible.height()),
                     toQt(Theme::hairline));
    painter.setPen(toQt(Theme::secondaryText));
    for (std::uint64_t index = frame.firstRow; index < frame.endRow; ++index)
        paintText(painter, QString::number(firstBodyRow() + index + 1),
                  {left, frame.head + static_cast<double>(index) * frame.line - frame.visible.top(),
                   frame.numbers, frame.line},
                  true);
}

void TableContent::paintHead(QPainter& painter, const Frame& frame) const {
    const QRectF strip(0, 0, frame.visible.width(), frame.head);
    painter.fillRect(strip, toQt(Theme::bar));
    painter.setFont(headFont_);
    painter.setPen(toQt(shape_.named ? Theme::text : Theme::secondaryText));
    for (std::size_t i = frame.firstColumn; i < frame.endColumn; ++i) {
        const TableShape::Column& column = shape_.columns[i];
        const QRectF cell = placed(frame, frame.numbers + starts_[i], 0, column.width, frame.head);
        paintText(painter, shape_.named ? column.name : letters(i), cell, column.numbers);
        painter.fillRect(QRectF(rightToLeft_ ? cell.left() : cell.right() - frame.pixel, 0,
                                frame.pixel, frame.head),
                         toQt(Theme::hairline));
    }
    const double left = rightToLeft_ ? frame.visible.width() - frame.numbers : 0;
    painter.fillRect(QRectF(left, 0, frame.numbers, frame.head), toQt(Theme::bar));
    painter.fillRect(QRectF(0, frame.head - frame.pixel, strip.width(), frame.pixel),
                     toQt(Theme::hairline));
}

} // namespace platform
