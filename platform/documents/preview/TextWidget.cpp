#include "platform/documents/preview/TextWidget.h"

#include "platform/documents/list/RowStyle.h"
#include "platform/ui/Direction.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"

#include <QFontDatabase>
#include <QKeyEvent>
#include <QPainter>
#include <QScrollBar>
#include <QTouchEvent>
#include <QWheelEvent>

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

constexpr double notch = 120;
constexpr double stepPerNotch = 80;
constexpr double keyStep = 48;
constexpr double edge = 12;
/// The end of the text can be drawn above the buttons that float over it.
constexpr double edgeBelow = 112;
constexpr double lineHeightFactor = 1.4;
constexpr int tabColumns = 4;
constexpr int scrollBarWidth = 12;
constexpr int scrollBarSteps = 1'000'000;
/// Lines kept on either side of the view; more are dropped and read again when they are wanted.
constexpr std::size_t mostLinesAside = 4000;
/// More is asked for when fewer are left.
constexpr std::size_t fewLines = 200;
constexpr double smallestZoom = 0.6;
constexpr double largestZoom = 4;

QFont textFont(double zoom) {
    QFont font = QFontDatabase::systemFont(QFontDatabase::FixedFont);
    const double points = Font::preferred(TextStyle::footnote).pointSize() * zoom;
    font.setPixelSize(std::max(6, static_cast<int>(std::lround(points))));
    font.setHintingPreference(QFont::PreferNoHinting);
    return font;
}

} // namespace

TextWidget::TextWidget(Wishes wishes)
    : wishes_(std::move(wishes)),
      font_(textFont(1)),
      scrollBar_(new QScrollBar(Qt::Vertical, this)),
      flinger_([this](Point stretch) { return scrollBy(-stretch.y); }) {
    setFocusPolicy(Qt::StrongFocus);
    setAttribute(Qt::WA_AcceptTouchEvents);
    scrollBar_->setFocusPolicy(Qt::NoFocus);
    scrollBar_->hide();
    QObject::connect(scrollBar_, &QScrollBar::valueChanged, this, [this](int value) {
        jumpTo(start_ + static_cast<std::uint64_t>(static_cast<double>(size_ - start_) * value /
                                                   scrollBarSteps));
    });
}

TextWidget::~TextWidget() = default;

void TextWidget::setLines(std::vector<TextLine> lines, std::uint64_t start, std::uint64_t size,
                          std::uint64_t top) {
    lines_.clear();
    start_ = start;
    size_ = size;
    top_ = 0;
    above_ = 0;
    asksBefore_ = asksAfter_ = false;
    for (TextLine& line : lines) {
        if (line.offset <= top)
            top_ = lines_.size();
        lines_.push_back({std::move(line), nullptr, 0});
    }
    keepEndInView();
    updateScrollBar();
    askForMore();
    update();
}

void TextWidget::appendLines(std::vector<TextLine> lines) {
    asksAfter_ = false;
    for (TextLine& line : lines)
        if (lines_.empty() || line.offset == lines_.back().line.end)
            lines_.push_back({std::move(line), nullptr, 0});
    while (top_ > mostLinesAside) {
        lines_.pop_front();
        --top_;
    }
    keepEndInView();
    updateScrollBar();
    update();
}

void TextWidget::prependLines(std::vector<TextLine> lines) {
    asksBefore_ = false;
    for (auto line = lines.rbegin(); line != lines.rend(); ++line)
        if (lines_.empty() || line->end == lines_.front().line.offset) {
            lines_.push_front({std::move(*line), nullptr, 0});
            ++top_;
        }
    while (lines_.size() > top_ + mostLinesAside)
        lines_.pop_back();
    updateScrollBar();
    update();
}

std::uint64_t TextWidget::topOffset() const {
    return top_ < lines_.size() ? lines_[top_].line.offset : start_;
}

void TextWidget::zoomBy(double factor) {
    zoom_ = std::clamp(zoom_ * factor, smallestZoom, largestZoom);
    font_ = textFont(zoom_);
    forgetLayouts();
    keepEndInView();
    update();
}

double TextWidget::lineWidth() const {
    return std::max(40.0, width() - 2 * RowStyle::current().margin);
}

double TextWidget::viewHeight() const {
    return std::max(1.0, height() - edge - edgeBelow);
}

void TextWidget::layOut(Laid& laid) const {
    laid.layout = std::make_unique<QTextLayout>(laid.line.text, font_);
    QTextOption option;
    option.setWrapMode(QTextOption::WrapAtWordBoundaryOrAnywhere);
    const QFontMetricsF metrics(font_);
    option.setTabStopDistance(tabColumns * metrics.horizontalAdvance(QLatin1Char(' ')));
    laid.layout->setTextOption(option);
    const double step = std::round(font_.pixelSize() * lineHeightFactor);
    double y = 0;
    laid.layout->beginLayout();
    for (QTextLine line = laid.layout->createLine(); line.isValid();
         line = laid.layout->createLine()) {
        line.setLineWidth(lineWidth());
        line.setPosition({0, y + std::floor((step - line.height()) / 2)});
        y += step;
    }
    laid.layout->endLayout();
    laid.height = std::max(step, y);
}

double TextWidget::heightOf(std::size_t index) {
    Laid& laid = lines_[index];
    if (!laid.layout)
        layOut(laid);
    return laid.height;
}

void TextWidget::forgetLayouts() {
    for (Laid& laid : lines_)
        laid.layout.reset();
    above_ = 0;
}

bool TextWidget::scrollBy(double distance) {
    if (lines_.empty())
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
    askForMore();
    updateScrollBar();
    update();
    return free && top == top_ && above == above_;
}

/// The last line of the text does not go above the lower edge.
void TextWidget::keepEndInView() {
    double free = viewHeight() + above_;
    for (std::size_t i = top_; i < lines_.size() && free > 0; ++i)
        free -= heightOf(i);
    if (free <= 0)
        return;
    above_ -= free;
    while (above_ < 0 && top_ > 0)
        above_ += heightOf(--top_);
    above_ = std::max(0.0, above_);
}

void TextWidget::askForMore() {
    if (lines_.empty())
        return;
    if (!asksBefore_ && top_ < fewLines && lines_.front().line.offset > start_) {
        asksBefore_ = true;
        wishes_.linesBefore(lines_.front().line.offset);
    }
    if (!asksAfter_ && lines_.size() < top_ + fewLines && lines_.back().line.end < size_) {
        asksAfter_ = true;
        wishes_.linesFrom(lines_.back().line.end);
    }
}

void TextWidget::updateScrollBar() {
    // By bytes: the height of lines that were never read is not known.
    std::uint64_t end = topOffset();
    double room = viewHeight() + above_;
    for (std::size_t i = top_; i < lines_.size() && room > 0; ++i) {
        room -= heightOf(i);
        end = lines_[i].line.end;
    }
    const double all = static_cast<double>(std::max<std::uint64_t>(1, size_ - start_));
    const bool whole = topOffset() <= start_ && end >= size_;
    scrollBar_->setVisible(!whole);
    const double page = static_cast<double>(end - topOffset()) / all;
    const QSignalBlocker quiet(scrollBar_);
    scrollBar_->setRange(0, static_cast<int>(scrollBarSteps * (1 - std::min(page, 0.99))));
    scrollBar_->setPageStep(std::max(1, static_cast<int>(scrollBarSteps * page)));
    scrollBar_->setValue(
        static_cast<int>(static_cast<double>(topOffset() - start_) / all * scrollBarSteps));
}

void TextWidget::jumpTo(std::uint64_t offset) {
    if (!lines_.empty() && offset >= lines_.front().line.offset &&
        offset < lines_.back().line.end) {
        const auto behind = std::upper_bound(
            lines_.begin(), lines_.end(), offset,
            [](std::uint64_t place, const Laid& laid) { return place < laid.line.offset; });
        top_ = static_cast<std::size_t>(behind - lines_.begin()) - 1;
        above_ = 0;
        scrollBy(0);
    } else {
        wishes_.linesAround(offset);
    }
}

void TextWidget::paintEvent(QPaintEvent* /*event*/) {
    QPainter painter(this);
    painter.fillRect(rect(), toQt(Theme::page));
    painter.setPen(toQt(Theme::text));
    const double x = mirrored({RowStyle::current().margin, 0, lineWidth(), 0}, width()).x;
    double y = edge - above_;
    for (std::size_t i = top_; i < lines_.size() && y < height(); ++i) {
        const double line = heightOf(i);
        lines_[i].layout->draw(&painter, {x, y});
        y += line;
    }
}

void TextWidget::resizeEvent(QResizeEvent* event) {
    QWidget::resizeEvent(event);
    const bool rightToLeft = layoutDirection() == Qt::RightToLeft;
    scrollBar_->setGeometry(rightToLeft ? 0 : width() - scrollBarWidth, 0, scrollBarWidth,
                            height());
    forgetLayouts();
    keepEndInView();
    updateScrollBar();
}

bool TextWidget::event(QEvent* event) {
    switch (event->type()) {
    case QEvent::TouchBegin:
    case QEvent::TouchUpdate:
    case QEvent::TouchEnd:
    case QEvent::TouchCancel:
        return touch(static_cast<QTouchEvent&>(*event));
    default:
        return QWidget::event(event);
    }
}

bool TextWidget::touch(QTouchEvent& event) {
    event.accept();
    if (event.points().isEmpty())
        return true;
    drag(event.points()[0].position(), event.type() == QEvent::TouchBegin,
         event.type() == QEvent::TouchEnd);
    return true;
}

void TextWidget::drag(QPointF point, bool first, bool last) {
    if (first) {
        flinger_.stop();
        flinger_.forget();
    } else {
        scrollBy(dragged_.y() - point.y());
    }
    dragged_ = point;
    flinger_.track({point.x(), point.y()});
    if (last)
        flinger_.release();
}

void TextWidget::mousePressEvent(QMouseEvent* event) {
    if (event->button() == Qt::LeftButton)
        drag(event->position(), true, false);
}

void TextWidget::mouseMoveEvent(QMouseEvent* event) {
    if (event->buttons().testFlag(Qt::LeftButton))
        drag(event->position(), false, false);
}

void TextWidget::mouseReleaseEvent(QMouseEvent* event) {
    if (event->button() == Qt::LeftButton)
        drag(event->position(), false, true);
}

void TextWidget::wheelEvent(QWheelEvent* event) {
    event->accept();
    flinger_.stop();
    const double notches = event->angleDelta().y() / notch;
    if (event->modifiers().testFlag(Qt::ControlModifier))
        zoomBy(std::pow(1.1, notches));
    else
        scrollBy(event->pixelDelta().isNull() ? -notches * stepPerNotch : -event->pixelDelta().y());
}

void TextWidget::keyPressEvent(QKeyEvent* event) {
    const double page = std::max(keyStep, height() - 2 * keyStep);
    switch (event->key()) {
    case Qt::Key_Down:
        scrollBy(keyStep);
        break;
    case Qt::Key_Up:
        scrollBy(-keyStep);
        break;
    case Qt::Key_PageDown:
    case Qt::Key_Space:
        scrollBy(page);
        break;
    case Qt::Key_PageUp:
        scrollBy(-page);
        break;
    case Qt::Key_Home:
        jumpTo(start_);
        break;
    case Qt::Key_End:
        jumpTo(size_ == 0 ? 0 : size_ - 1);
        break;
    case Qt::Key_Plus:
    case Qt::Key_Equal:
        zoomBy(1.1);
        break;
    case Qt::Key_Minus:
        zoomBy(1 / 1.1);
        break;
    default:
        QWidget::keyPressEvent(event);
    }
}

} // namespace platform
