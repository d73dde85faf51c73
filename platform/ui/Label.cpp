#include "platform/ui/Controls.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/LabelImpl.h"
#include "platform/ui/qt/Settings.h"
#include "platform/ui/qt/TextMetrics.h"

#include <QFontMetricsF>
#include <QPainter>

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

LabelImpl& implOf(const Label& label) {
    return static_cast<LabelImpl&>(label.impl());
}

/// The run's box: its advance and how far it reaches above and below the line's baseline.
struct RunBox {
    double width;
    double above;
    double below;
};

RunBox boxOf(const StyledRun& run, const Font& font) {
    const LineMetrics line = lineMetrics(font);
    if (!run.image.empty())
        return {run.image.size().width, run.image.size().height + run.baselineOffset,
                -run.baselineOffset};
    return {font.width(run.text), line.ascent + run.baselineOffset,
            line.descent - run.baselineOffset};
}

} // namespace

LabelImpl::LabelImpl() : color(Theme::text) {
}

void LabelImpl::paintContent(QPainter& painter, const QRectF& bounds) {
    if (!styled.runs.empty()) {
        paintStyled(painter, bounds);
        return;
    }
    painter.setPen(toQt(color));
    blockFor(bounds.width()).draw(painter, bounds, alignment);
}

void LabelImpl::settingsChanged() {
    blocks.clear();
    View::Impl::settingsChanged();
}

QAccessible::Role LabelImpl::accessibleRole() const {
    return !tapHandlers.empty() ? QAccessible::Button : QAccessible::StaticText;
}

QString LabelImpl::accessibleText() const {
    return toQt(styled.runs.empty() ? text : styled.plainText());
}

void LabelImpl::textChanged() {
    blocks.clear();
    updateAccessibleName();
    self->invalidateIntrinsicContentSize();
    self->setNeedsDisplay();
}

const TextBlock& LabelImpl::blockFor(double width) const {
    return blocks.block(toQt(text), style(), width);
}

Size LabelImpl::styledSize() const {
    RunBox all{0, 0, 0};
    for (const StyledRun& run : styled.runs) {
        const RunBox box = boxOf(run, font);
        all = {all.width + box.width, std::max(all.above, box.above),
               std::max(all.below, box.below)};
    }
    return {std::ceil(all.width), std::ceil(all.above + all.below)};
}

void LabelImpl::paintStyled(QPainter& painter, const QRectF& bounds) const {
    const bool rightToLeft = isRightToLeft();
    double above = 0;
    for (const StyledRun& run : styled.runs)
        above = std::max(above, boxOf(run, font).above);
    const double baseline =
        bounds.top() + std::floor((bounds.height() - styledSize().height) / 2) + std::ceil(above);
    double at = 0;
    const QFontMetricsF metrics(toQt(font));
    painter.setFont(toQt(font));
    painter.setPen(toQt(color));
    // A run's space before the next one stays between them.
    painter.setLayoutDirection(rightToLeft ? Qt::RightToLeft : Qt::LeftToRight);
    for (const StyledRun& run : styled.runs) {
        const double room = bounds.width() - at;
        const double width = std::min(boxOf(run, font).width, room);
        if (width <= 0)
            break;
        const double left = rightToLeft ? bounds.right() - at - width : bounds.left() + at;
        const double y = baseline - run.baselineOffset;
        const Size picture = run.image.size();
        if (run.image.empty())
            painter.drawText(QPointF(left, y),
                             metrics.elidedText(toQt(run.text), Qt::ElideRight, room + 0.5));
        else if (picture.width <= room)
            paintImage(painter, run.image,
                       QRectF(left, y - picture.height, picture.width, picture.height));
        at += width;
    }
}

Label::Label(Rect frame) : View(std::make_unique<LabelImpl>()) {
    setFrame(frame);
}

const std::string& Label::text() const {
    return implOf(*this).text;
}

void Label::setText(std::string_view text) {
    LabelImpl& impl = implOf(*this);
    if (impl.styled.runs.empty() && impl.text == text)
        return;
    impl.text = text;
    impl.styled.runs.clear();
    impl.textChanged();
}

void Label::setStyledText(const StyledText& text) {
    LabelImpl& impl = implOf(*this);
    impl.text.clear();
    impl.styled = text;
    impl.textChanged();
}

Font Label::font() const {
    return implOf(*this).font;
}

void Label::setFont(Font font) {
    LabelImpl& impl = implOf(*this);
    if (impl.font == font)
        return;
    impl.font = font;
    impl.textChanged();
}

Color Label::textColor() const {
    return implOf(*this).color;
}

void Label::setTextColor(Color color) {
    implOf(*this).color = color;
    setNeedsDisplay();
}

TextAlignment Label::textAlignment() const {
    return implOf(*this).alignment;
}

void Label::setTextAlignment(TextAlignment alignment) {
    implOf(*this).alignment = alignment;
    setNeedsDisplay();
}

int Label::numberOfLines() const {
    return implOf(*this).lines;
}

void Label::setNumberOfLines(int lines) {
    LabelImpl& impl = implOf(*this);
    if (impl.lines == lines)
        return;
    impl.lines = lines;
    impl.textChanged();
}

void Label::setLineBreak(LineBreak mode) {
    implOf(*this).lineBreak = mode;
    implOf(*this).textChanged();
}

bool Label::isTruncated() const {
    const LabelImpl& impl = implOf(*this);
    if (!impl.styled.runs.empty())
        return impl.styledSize().width > frame().width;
    return impl.blockFor(frame().width).isElided();
}

Size Label::intrinsicContentSize() const {
    const LabelImpl& impl = implOf(*this);
    if (!impl.styled.runs.empty())
        return impl.styledSize();
    if (impl.text.empty())
        return {0, 0};
    const QSizeF size = impl.blockFor(TextBlock::unlimitedWidth).size();
    return {size.width(), size.height()};
}

double Label::intrinsicHeightForWidth(double width) const {
    const LabelImpl& impl = implOf(*this);
    if (impl.lines == 1 || impl.text.empty() || !impl.styled.runs.empty())
        return noIntrinsicMetric;
    return impl.blockFor(width).size().height();
}

} // namespace platform
