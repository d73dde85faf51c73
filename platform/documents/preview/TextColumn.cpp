#include "platform/documents/preview/TextColumn.h"

#include "platform/documents/preview/SyntaxColors.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"

#include <QFontMetricsF>
#include <QPainter>

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

constexpr double lineHeightFactor = 1.4;
constexpr int tabColumns = 4;
/// Lines kept on either side of the view; more are dropped and read again when they are wanted.
constexpr std::size_t mostLinesAside = 4000;

QList<QTextLayout::FormatRange> formatsOf(const std::vector<SyntaxSpan>& spans) {
    QList<QTextLayout::FormatRange> formats;
    for (const SyntaxSpan& span : spans) {
        QTextLayout::FormatRange& range = formats.emplaceBack();
        range.start = span.start;
        range.length = span.length;
        range.format.setForeground(toQt(syntaxColor(span.kind, Theme::page)));
    }
    return formats;
}

} // namespace

TextColumn::TextColumn(Qt::LayoutDirection direction) : direction_(direction) {
}
TextColumn::~TextColumn() = default;

bool TextColumn::holds(std::uint64_t offset) const {
    return !isEmpty() && offset >= firstOffset() && offset < endOffset();
}

QString TextColumn::text() const {
    QString all;
    for (const Laid& laid : lines_) {
        all += laid.line.text;
        if (!laid.line.goesOn)
            all += u'\n';
    }
    return all;
}

void TextColumn::set(std::vector<TextLine> lines, std::uint64_t top) {
    lines_.clear();
    top_ = 0;
    above_ = 0;
    for (TextLine& line : lines) {
        if (line.offset <= top)
            top_ = lines_.size();
        lines_.push_back({std::move(line), nullptr, 0});
    }
    keepEndInView();
}

void TextColumn::append(std::vector<TextLine> lines) {
    for (TextLine& line : lines)
        if (isEmpty() || line.offset == endOffset())
            lines_.push_back({std::move(line), nullptr, 0});
    for (; top_ > mostLinesAside; --top_)
        lines_.pop_front();
    keepEndInView();
}

void TextColumn::prepend(std::vector<TextLine> lines) {
    for (auto line = lines.rbegin(); line != lines.rend(); ++line)
        if (isEmpty() || line->end == firstOffset()) {
            lines_.push_front({std::move(*line), nullptr, 0});
            ++top_;
        }
    while (lines_.size() > top_ + mostLinesAside)
        lines_.pop_back();
}

void TextColumn::setShape(const QFont& font, double width, double viewHeight) {
    font_ = font;
    width_ = width;
    viewHeight_ = viewHeight;
    for (Laid& laid : lines_)
        laid.layout.reset();
    above_ = 0;
    keepEndInView();
}

void TextColumn::layOut(Laid& laid) const {
    laid.layout = std::make_unique<QTextLayout>(laid.line.text, font_);
    QTextOption option;
    option.setWrapMode(QTextOption::WrapAtWordBoundaryOrAnywhere);
    const QFontMetricsF metrics(font_);
    option.setTabStopDistance(tabColumns * metrics.horizontalAdvance(QLatin1Char(' ')));
    option.setTextDirection(direction_);
    laid.layout->setTextOption(option);
    laid.layout->setFormats(formatsOf(laid.line.spans));
    const double step = rowHeight();
    double y = 0;
    laid.layout->beginLayout();
    for (QTextLine line = laid.layout->createLine(); line.isValid();
         line = laid.layout->createLine()) {
        line.setLineWidth(width_);
        line.setPosition({0, y + std::floor((step - line.height()) / 2)});
        y += step;
    }
    laid.layout->endLayout();
    laid.height = std::max(step, y);
}

double TextColumn::rowHeight() const {
    return std::round(font_.pixelSize() * lineHeightFactor);
}

std::uint64_t TextColumn::largestNumber() const {
    for (auto laid = lines_.rbegin(); laid != lines_.rend(); ++laid)
        if (laid->line.number)
            return laid->line.number;
    return 0;
}

double TextColumn::heightOf(std::size_t index) {
    Laid& laid = lines_[index];
    if (!laid.layout)
        layOut(laid);
    return laid.height;
}

bool TextColumn::scrollBy(double distance) {
    if (isEmpty())
        return false;
    above_ += distance;
    while (above_ < 0 && top_ > 0)
        above_ += heightOf(--top_);
    while (top_ + 1 < lines_.size() && above_ >= heightOf(top_))
        above_ -= heightOf(top_++);
    const bool free = above_ >= 0;
    above_ = std::max(0.0, above_);
    const std::size_t top = top_;
    const double above = above_;
    keepEndInView();
    return free && top == top_ && above == above_;
}

/// The last line of the text does not go above the lower edge.
void TextColumn::keepEndInView() {
    double free = viewHeight_ + above_;
    for (std::size_t i = top_; i < lines_.size() && free > 0; ++i)
        free -= heightOf(i);
    if (free <= 0)
        return;
    above_ -= free;
    while (above_ < 0 && top_ > 0)
        above_ += heightOf(--top_);
    above_ = std::max(0.0, above_);
}

void TextColumn::goTo(std::uint64_t offset) {
    const auto behind = std::upper_bound(
        lines_.begin(), lines_.end(), offset,
        [](std::uint64_t place, const Laid& laid) { return place < laid.line.offset; });
    top_ = static_cast<std::size_t>(behind - lines_.begin()) - 1;
    above_ = 0;
    keepEndInView();
}

std::uint64_t TextColumn::bottomOffset() {
    std::uint64_t end = topOffset();
    double room = viewHeight_ + above_;
    for (std::size_t i = top_; i < lines_.size() && room > 0; ++i) {
        room -= heightOf(i);
        end = lines_[i].line.end;
    }
    return end;
}

void TextColumn::paint(QPainter& painter, QPointF corner, double bottom, const Aside& aside) {
    double y = corner.y() - above_;
    for (std::size_t i = top_; i < lines_.size() && y < bottom; ++i) {
        const double height = heightOf(i);
        lines_[i].layout->draw(&painter, {corner.x(), y});
        if (aside)
            aside(lines_[i].line, y, rowHeight());
        y += height;
    }
}

} // namespace platform
