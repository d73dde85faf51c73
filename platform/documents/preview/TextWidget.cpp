#include "platform/documents/preview/TextWidget.h"

#include "platform/documents/preview/PageMetrics.h"
#include "platform/ui/Direction.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/TouchEvents.h"

#include <QFontDatabase>
#include <QKeyEvent>
#include <QPainter>
#include <QScrollBar>
#include <QWheelEvent>

#include <algorithm>
#include <cmath>
#include <string>
#include <utility>

namespace platform {
namespace {

using namespace pageMetrics;

constexpr double lineStep = 48;
constexpr double textEdge = 12;
/// More is asked for when fewer are left.
constexpr std::size_t fewLines = 200;
constexpr double narrowestLine = 40;
/// Between the numbers of lines and what stands beside them.
constexpr double gutterGap = 8;
constexpr int fewestFigures = 3;
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

TextWidget::TextWidget(Wishes wishes, Style style)
    : wishes_(std::move(wishes)),
      style_(style),
      column_(style == Style::code ? Qt::LeftToRight : Qt::LayoutDirectionAuto),
      scrollBar_(new QScrollBar(Qt::Vertical, this)),
      flinger_([this](Point stretch) { return scrollBy(-stretch.y); }) {
    installTextAccessibility();
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
    start_ = start;
    size_ = size;
    asksBefore_ = asksAfter_ = false;
    column_.set(std::move(lines), top);
    linesChanged();
    askForMore();
}

void TextWidget::appendLines(std::vector<TextLine> lines) {
    asksAfter_ = false;
    column_.append(std::move(lines));
    linesChanged();
}

void TextWidget::prependLines(std::vector<TextLine> lines) {
    asksBefore_ = false;
    column_.prepend(std::move(lines));
    linesChanged();
}

std::uint64_t TextWidget::topOffset() const {
    return column_.isEmpty() ? start_ : column_.topOffset();
}

void TextWidget::zoomBy(double factor) {
    zoom_ = std::clamp(zoom_ * factor, smallestZoom, largestZoom);
    shape();
    update();
}

void TextWidget::linesChanged() {
    if (style_ == Style::code) {
        const std::size_t figures = std::to_string(column_.largestNumber()).size();
        const int wanted = std::max(fewestFigures, static_cast<int>(figures));
        // Never narrower again: the text would jump at each turn.
        if (wanted > std::exchange(figures_, std::max(wanted, figures_)))
            shape();
    }
    updateScrollBar();
    update();
}

double TextWidget::gutterWidth() const {
    if (style_ == Style::prose)
        return 0;
    const QFontMetricsF metrics(textFont(zoom_));
    return std::ceil(figures_ * metrics.horizontalAdvance(QLatin1Char('0')) + 2 * gutterGap);
}

double TextWidget::textLeft() const {
    if (style_ == Style::prose)
        return mirrored({pageMargin(), 0, lineWidth(), 0}, width()).x;
    // A scroll bar at the left has its place between.
    const bool rightToLeft = layoutDirection() == Qt::RightToLeft;
    return gutterWidth() + gutterGap + (rightToLeft ? scrollBarWidth : 0);
}

double TextWidget::lineWidth() const {
    const double taken =
        style_ == Style::prose ? 2 * pageMargin() : gutterWidth() + 2 * gutterGap + scrollBarWidth;
    return std::max(narrowestLine, width() - taken);
}

void TextWidget::shape() {
    column_.setShape(textFont(zoom_), lineWidth(), std::max(1.0, height() - textEdge - edgeBelow));
    updateScrollBar();
}

bool TextWidget::scrollBy(double distance) {
    const bool free = column_.scrollBy(distance);
    askForMore();
    updateScrollBar();
    update();
    return free;
}

void TextWidget::askForMore() {
    if (column_.isEmpty())
        return;
    if (!asksBefore_ && column_.linesBefore() < fewLines && column_.firstOffset() > start_) {
        asksBefore_ = true;
        wishes_.linesBefore(column_.firstOffset());
    }
    if (!asksAfter_ && column_.linesFromTop() < fewLines && column_.endOffset() < size_) {
        asksAfter_ = true;
        wishes_.linesFrom(column_.endOffset());
    }
}

void TextWidget::updateScrollBar() {
    if (column_.isEmpty()) {
        scrollBar_->hide();
        return;
    }
    // By bytes: the height of lines that were never read is not known.
    const std::uint64_t top = column_.topOffset();
    const std::uint64_t end = column_.bottomOffset();
    const double all = static_cast<double>(std::max<std::uint64_t>(1, size_ - start_));
    scrollBar_->setVisible(top > start_ || end < size_);
    const double page = static_cast<double>(end - top) / all;
    const QSignalBlocker quiet(scrollBar_);
    scrollBar_->setRange(0, static_cast<int>(scrollBarSteps * (1 - std::min(page, 0.99))));
    scrollBar_->setPageStep(std::max(1, static_cast<int>(scrollBarSteps * page)));
    scrollBar_->setValue(
        static_cast<int>(static_cast<double>(top - start_) / all * scrollBarSteps));
}

void TextWidget::jumpTo(std::uint64_t offset) {
    if (!column_.holds(offset)) {
        wishes_.linesAround(offset);
        return;
    }
    column_.goTo(offset);
    askForMore();
    updateScrollBar();
    update();
}

void TextWidget::paintEvent(QPaintEvent* /*event*/) {
    QPainter painter(this);
    painter.fillRect(rect(), toQt(Theme::page));
    paintGutter(painter);
    TextColumn::Aside aside;
    if (style_ == Style::code)
        aside = [&](const TextLine& line, double y, double height) {
            paintNumber(painter, line, y, height);
        };
    painter.setPen(toQt(Theme::text));
    column_.paint(painter, {textLeft(), textEdge}, height(), aside);
}

void TextWidget::paintGutter(QPainter& painter) const {
    if (style_ == Style::prose || column_.isEmpty())
        return;
    const double width = gutterWidth();
    painter.fillRect(QRectF(0, 0, width, height()), toQt(Theme::bar));
    painter.fillRect(QRectF(width - 1, 0, 1, height()), toQt(Theme::hairline));
}

void TextWidget::paintNumber(QPainter& painter, const TextLine& line, double y,
                             double height) const {
    if (line.number == 0)
        return;
    painter.save();
    painter.setFont(textFont(zoom_));
    painter.setPen(toQt(Theme::secondaryText));
    const double top = y + std::floor((height - painter.fontMetrics().height()) / 2);
    painter.drawText(QRectF(0, top, gutterWidth() - gutterGap, height),
                     Qt::AlignTop | Qt::AlignRight | Qt::TextDontClip,
                     QString::number(line.number));
    painter.restore();
}

void TextWidget::resizeEvent(QResizeEvent* event) {
    QWidget::resizeEvent(event);
    const bool rightToLeft = layoutDirection() == Qt::RightToLeft;
    scrollBar_->setGeometry(rightToLeft ? 0 : width() - scrollBarWidth, 0, scrollBarWidth,
                            height());
    shape();
}

bool TextWidget::event(QEvent* event) {
    QTouchEvent* const fingers = touchOf(event);
    return fingers ? touch(*fingers) : QWidget::event(event);
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
    // Alt+Left, for one, is the screen's.
    if (event->modifiers() & (Qt::AltModifier | Qt::MetaModifier)) {
        QWidget::keyPressEvent(event);
        return;
    }
    const double page = std::max(lineStep, height() - 2 * lineStep);
    switch (event->key()) {
    case Qt::Key_Down:
        scrollBy(lineStep);
        break;
    case Qt::Key_Up:
        scrollBy(-lineStep);
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
