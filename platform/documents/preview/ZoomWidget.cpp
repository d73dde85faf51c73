#include "platform/documents/preview/ZoomWidget.h"

#include "platform/base/Runtime.h"
#include "platform/documents/preview/PageMetrics.h"
#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/TouchEvents.h"

#include <QKeyEvent>
#include <QMouseEvent>
#include <QNativeGestureEvent>
#include <QPainter>
#include <QScrollBar>
#include <QWheelEvent>

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

using namespace pageMetrics;

constexpr double zoomPerNotch = 1.2;
constexpr double keyStep = 60;
constexpr double doubleTapZoom = 2.5;
constexpr double slop = 10;
constexpr Duration doubleTapTime = std::chrono::milliseconds(350);
constexpr double doubleTapReach = 40;

Point pointOf(QPointF point) {
    return {point.x(), point.y()};
}

double distanceOf(const QTouchEvent& event) {
    const QPointF way = event.points()[1].position() - event.points()[0].position();
    return std::max(1.0, std::hypot(way.x(), way.y()));
}

QPointF middleOf(const QTouchEvent& event) {
    return (event.points()[0].position() + event.points()[1].position()) / 2;
}

} // namespace

ZoomWidget::ZoomWidget(std::unique_ptr<ZoomContent> content, const Settings& settings)
    : content_(std::move(content)),
      wheelZooms_(settings.wheelZooms),
      ground_(settings.ground),
      place_(settings.limits),
      flinger_([this](Point stretch) {
          return moveBy({stretch.x, stretch.y});
      }) {
    installTextAccessibility();
    setFocusPolicy(Qt::StrongFocus);
    setAttribute(Qt::WA_AcceptTouchEvents);
    setAttribute(Qt::WA_OpaquePaintEvent, false);
    if (!settings.scrollBars)
        return;
    for (auto [bar, direction] : {std::pair(&across_, Qt::Horizontal), {&down_, Qt::Vertical}}) {
        *bar = new QScrollBar(direction, this);
        (*bar)->setFocusPolicy(Qt::NoFocus);
        // Its places are the content's, which are counted from the left.
        (*bar)->setLayoutDirection(Qt::LeftToRight);
        (*bar)->hide();
        QObject::connect(*bar, &QScrollBar::valueChanged, this, [this, way = direction](int value) {
            place_.scrollTo(way, place_.extent(way).length * value / scrollBarSteps);
            changed();
        });
    }
}

ZoomWidget::~ZoomWidget() = default;

void ZoomWidget::zoomBy(double factor) {
    if (zoomed_)
        zoomed_(factor);
    else
        zoomAround(zoom() * factor, rect().center());
}

void ZoomWidget::showTop(double y) {
    place_.moveBy({0, -(y - visibleRect().top()) * zoom()});
    changed();
}

void ZoomWidget::zoomAround(double zoom, QPointF point) {
    place_.zoomTo(zoom, point);
    changed();
}

void ZoomWidget::toggleZoom(QPointF point) {
    const double fitting = place_.fittingZoom();
    zoomAround(zoom() > fitting * 1.05 ? fitting : fitting * doubleTapZoom, point);
}

void ZoomWidget::fitAgain() {
    zoomAround(place_.fittingZoom(), rect().center());
}

void ZoomWidget::contentChanged() {
    place_.setSizes(size(), content_->contentSize());
    changed();
}

bool ZoomWidget::moveBy(QPointF distance) {
    const bool free = place_.moveBy(distance);
    changed();
    return free;
}

void ZoomWidget::changed() {
    update();
    updateScrollBar(across_);
    updateScrollBar(down_);
    if (moved_)
        moved_();
}

void ZoomWidget::updateScrollBar(QScrollBar* bar) const {
    if (!bar)
        return;
    const ZoomPlace::Extent extent = place_.extent(bar->orientation());
    const QSignalBlocker quiet(bar);
    bar->setVisible(extent.length > extent.view + 1);
    const auto steps = [&](double points) {
        return static_cast<int>(std::max(0.0, points / extent.length * scrollBarSteps));
    };
    bar->setRange(0, steps(extent.length - extent.view));
    bar->setPageStep(steps(extent.view));
    bar->setSingleStep(steps(keyStep));
    bar->setValue(steps(extent.offset));
}

void ZoomWidget::paintEvent(QPaintEvent* /*event*/) {
    QPainter painter(this);
    painter.fillRect(rect(), toQt(ground_));
    painter.setRenderHint(QPainter::SmoothPixmapTransform);
    painter.translate(place_.origin());
    painter.scale(zoom(), zoom());
    content_->paintContent(painter, visibleRect(), zoom());
}

void ZoomWidget::resizeEvent(QResizeEvent* event) {
    QWidget::resizeEvent(event);
    if (down_) {
        const bool rightToLeft = layoutDirection() == Qt::RightToLeft;
        down_->setGeometry(rightToLeft ? 0 : width() - scrollBarWidth, 0, scrollBarWidth, height());
        across_->setGeometry(0, height() - scrollBarWidth, width(), scrollBarWidth);
    }
    contentChanged();
}

bool ZoomWidget::event(QEvent* event) {
    if (QTouchEvent* const fingers = touchOf(event))
        return touch(*fingers);
    if (event->type() != QEvent::NativeGesture)
        return QWidget::event(event);
    const auto& gesture = static_cast<QNativeGestureEvent&>(*event);
    if (gesture.gestureType() != Qt::ZoomNativeGesture)
        return QWidget::event(event);
    zoomAround(zoom() * (1 + gesture.value()), gesture.position());
    return true;
}

bool ZoomWidget::touch(QTouchEvent& event) {
    event.accept();
    if (event.points().size() >= 2 && event.type() != QEvent::TouchEnd) {
        pinch(event);
        return true;
    }
    const bool over = event.type() == QEvent::TouchEnd || event.type() == QEvent::TouchCancel;
    const bool pinched = pinch_.has_value();
    if (pinched && event.type() != QEvent::TouchBegin) {
        if (over)
            pinch_.reset();
        return true;
    }
    const QPointF at = event.points().isEmpty() ? QPointF() : event.points()[0].position();
    if (event.type() == QEvent::TouchBegin) {
        flinger_.stop();
        flinger_.forget();
        dragged_ = tap_ = at;
    } else if (dragged_) {
        moveBy(at - *dragged_);
        dragged_ = at;
        if (tap_ && (at - *tap_).manhattanLength() > slop)
            tap_.reset();
    }
    flinger_.track(pointOf(at));
    if (!over)
        return true;
    dragged_.reset();
    if (event.type() == QEvent::TouchCancel)
        return true;
    if (!tap_)
        flinger_.release();
    else
        tap(at);
    return true;
}

void ZoomWidget::tap(QPointF point) {
    if (tapped_ && tapped_(place_.toContent(point)))
        return;
    if (tappedTwice(point))
        toggleZoom(point);
}

void ZoomWidget::pinch(const QTouchEvent& event) {
    dragged_.reset();
    tap_.reset();
    const QPointF middle = middleOf(event);
    if (!pinch_) {
        pinch_ = Pinch{distanceOf(event), zoom(), place_.toContent(middle)};
        return;
    }
    place_.bring(pinch_->content, pinch_->zoom * distanceOf(event) / pinch_->distance, middle);
    changed();
}

bool ZoomWidget::tappedTwice(QPointF point) {
    const Duration now = Runtime::current().clock.monotonic();
    const auto former = std::exchange(lastTap_, std::pair(now, point));
    const bool twice = former && now - former->first < doubleTapTime &&
                       (point - former->second).manhattanLength() < doubleTapReach;
    if (twice)
        lastTap_.reset();
    return twice;
}

void ZoomWidget::mousePressEvent(QMouseEvent* event) {
    if (event->button() != Qt::LeftButton)
        return;
    flinger_.stop();
    flinger_.forget();
    dragged_ = tap_ = event->position();
}

void ZoomWidget::mouseMoveEvent(QMouseEvent* event) {
    if (!dragged_ || !event->buttons().testFlag(Qt::LeftButton))
        return;
    moveBy(event->position() - *dragged_);
    dragged_ = event->position();
    if (tap_ && (event->position() - *tap_).manhattanLength() > slop)
        tap_.reset();
    flinger_.track(pointOf(event->position()));
}

void ZoomWidget::mouseReleaseEvent(QMouseEvent* event) {
    if (event->button() != Qt::LeftButton || !dragged_)
        return;
    dragged_.reset();
    if (!tap_)
        flinger_.release();
    else if (tapped_)
        tapped_(place_.toContent(event->position()));
}

void ZoomWidget::mouseDoubleClickEvent(QMouseEvent* event) {
    if (event->button() == Qt::LeftButton)
        toggleZoom(event->position());
}

void ZoomWidget::wheelEvent(QWheelEvent* event) {
    event->accept();
    flinger_.stop();
    const double notches = event->angleDelta().y() / notch;
    if (wheelZooms_ || event->modifiers().testFlag(Qt::ControlModifier)) {
        if (zoomed_)
            zoomed_(std::pow(zoomPerNotch, notches));
        else
            zoomAround(zoom() * std::pow(zoomPerNotch, notches), event->position());
        return;
    }
    const QPointF pixels = event->pixelDelta();
    const QPointF turned = QPointF(event->angleDelta()) / notch * stepPerNotch;
    moveBy(pixels.isNull() ? turned : pixels);
}

void ZoomWidget::keyPressEvent(QKeyEvent* event) {
    // Alt+Left, for one, is the screen's.
    if (event->modifiers() & (Qt::AltModifier | Qt::MetaModifier)) {
        QWidget::keyPressEvent(event);
        return;
    }
    const double page = std::max(keyStep, height() - keyStep);
    switch (event->key()) {
    case Qt::Key_Plus:
    case Qt::Key_Equal:
        zoomBy(zoomPerNotch);
        break;
    case Qt::Key_Minus:
        zoomBy(1 / zoomPerNotch);
        break;
    case Qt::Key_0:
        fitAgain();
        break;
    case Qt::Key_Down:
        moveBy({0, -keyStep});
        break;
    case Qt::Key_Up:
        moveBy({0, keyStep});
        break;
    case Qt::Key_Right:
        moveBy({-keyStep, 0});
        break;
    case Qt::Key_Left:
        moveBy({keyStep, 0});
        break;
    case Qt::Key_PageDown:
    case Qt::Key_Space:
        moveBy({0, -page});
        break;
    case Qt::Key_PageUp:
        moveBy({0, page});
        break;
    case Qt::Key_Home:
        moveBy({0, 1e12});
        break;
    case Qt::Key_End:
        moveBy({0, -1e12});
        break;
    default:
        QWidget::keyPressEvent(event);
    }
}

} // namespace platform
