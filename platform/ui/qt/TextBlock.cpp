#include "platform/ui/qt/TextBlock.h"

#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/Settings.h"
#include "platform/ui/qt/TextMetrics.h"

#include <QFontMetricsF>
#include <QPainter>
#include <QTextOption>

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

/// A text whose natural width was rounded to its frame still fits.
constexpr double widthTolerance = 0.5;

std::unique_ptr<QTextLayout> makeLayout(const QString& text, const QFont& font, bool wraps) {
    auto layout = std::make_unique<QTextLayout>(text, font);
    QTextOption option;
    option.setWrapMode(wraps ? QTextOption::WrapAtWordBoundaryOrAnywhere : QTextOption::ManualWrap);
    option.setTextDirection(Qt::LayoutDirectionAuto);
    layout->setTextOption(option);
    layout->setCacheEnabled(true);
    return layout;
}

Qt::TextElideMode elideModeOf(LineBreak mode) {
    return mode == LineBreak::elideMiddle ? Qt::ElideMiddle : Qt::ElideRight;
}

} // namespace

TextBlock::TextBlock(const QString& text, const TextBlockStyle& style, double width) {
    QString broken = text;
    broken.replace(QLatin1Char('\n'), QChar(QChar::LineSeparator));
    layout_ = makeLayout(broken, toQt(style.font), style.maximumLines != 1);
    breakLines(width + widthTolerance);
    const auto limit = static_cast<std::size_t>(style.maximumLines);
    const bool tooMany = limit > 0 && lines_.size() > limit;
    const bool tooWide = style.maximumLines == 1 && !lines_.empty() &&
                         lineAt(lines_.front()).naturalTextWidth() > width + widthTolerance;
    if (tooMany || tooWide) {
        lines_.resize(std::max<std::size_t>(limit, 1));
        elideLast(broken, style, width);
    }
    stack(style.font);
}

void TextBlock::breakLines(double width) {
    layout_->beginLayout();
    for (QTextLine line = layout_->createLine(); line.isValid(); line = layout_->createLine()) {
        line.setLineWidth(width);
        lines_.push_back({layout_.get(), line.lineNumber(), 0, 0});
    }
    layout_->endLayout();
}

void TextBlock::elideLast(const QString& text, const TextBlockStyle& style, double width) {
    const QFont font = toQt(style.font);
    QString rest = text.mid(lineAt(lines_.back()).textStart());
    rest.replace(QChar(QChar::LineSeparator), QLatin1Char(' '));
    const QString shown =
        QFontMetricsF(font).elidedText(rest, elideModeOf(style.lineBreak), width + widthTolerance);
    last_ = makeLayout(shown, font, false);
    last_->beginLayout();
    last_->createLine().setLineWidth(unlimitedWidth);
    last_->endLayout();
    lines_.back() = {last_.get(), 0, 0, 0};
}

void TextBlock::stack(const Font& font) {
    const LineMetrics box = lineMetrics(font);
    double top = 0;
    double widest = 0;
    for (Line& line : lines_) {
        const QTextLine text = lineAt(line);
        // Scripts that stand taller than the typeface get the room that they need.
        const double above = std::max(box.ascent, std::ceil(text.ascent()));
        const double below = std::max(box.descent, std::ceil(text.descent()));
        const bool tall = text.ascent() + text.descent() > box.height;
        line.top = top;
        line.ascent = tall ? above : box.ascent;
        top += tall ? above + below : box.height;
        widest = std::max(widest, text.naturalTextWidth());
    }
    size_ = QSizeF(std::ceil(widest), top);
}

QTextLine TextBlock::lineAt(const Line& line) const {
    return line.layout->lineAt(line.index);
}

void TextBlock::draw(QPainter& painter, const QRectF& bounds, TextAlignment alignment) const {
    const double top = bounds.top() + std::floor((bounds.height() - size_.height()) / 2);
    const bool right = alignment == TextAlignment::right ||
                       (alignment == TextAlignment::natural && isRightToLeft());
    for (const Line& line : lines_) {
        const QTextLine text = lineAt(line);
        const double spare = bounds.width() - text.naturalTextWidth();
        double x = bounds.left();
        if (alignment == TextAlignment::center)
            x += std::floor(spare / 2);
        else if (right)
            x += spare;
        const double baseline = top + line.top + line.ascent;
        text.draw(&painter,
                  QPointF(x - text.naturalTextRect().left(), baseline - text.ascent() - text.y()));
    }
}

const TextBlock& TextBlockCache::block(const QString& text, const TextBlockStyle& style,
                                       double width) const {
    const double points = style.font.pointSize();
    for (const Entry& each : entries_)
        if (each.width == width && each.maximumLines == style.maximumLines && each.points == points)
            return *each.block;
    if (entries_.size() == capacity)
        entries_.erase(entries_.begin());
    entries_.push_back(
        {width, style.maximumLines, points, std::make_unique<TextBlock>(text, style, width)});
    return *entries_.back().block;
}

} // namespace platform
