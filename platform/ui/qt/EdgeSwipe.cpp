#include "platform/ui/qt/EdgeSwipe.h"

#include "platform/ui/Direction.h"
#include "platform/ui/qt/Settings.h"

#include <QCoreApplication>
#include <QMouseEvent>
#include <QTouchEvent>
#include <QWidget>

#include <algorithm>
#include <cmath>
#include <optional>

namespace platform {
namespace {

constexpr double edgeWidth = 24;
constexpr double slop = 10;
constexpr double farEnough = 0.5;
constexpr double fastEnough = 500; // points a second

bool isFinger(const QPointerEvent& event) {
    return event.pointingDevice() &&
           event.pointingDevice()->type() == QInputDevice::DeviceType::TouchScreen;
}

} // namespace

EdgeSwipe::EdgeSwipe(QWidget& area, Handlers handlers)
    : area_(&area), handlers_(std::move(handlers)) {
    QCoreApplication::instance()->installEventFilter(this);
}

EdgeSwipe::~EdgeSwipe() = default;

bool EdgeSwipe::eventFilter(QObject* watched, QEvent* event) {
    std::optional<Kind> kind;
    switch (event->type()) {
    case QEvent::MouseButtonPress:
    case QEvent::TouchBegin:
        kind = Kind::press;
        break;
    case QEvent::MouseMove:
    case QEvent::TouchUpdate:
        kind = Kind::move;
        break;
    case QEvent::MouseButtonRelease:
    case QEvent::TouchEnd:
        kind = Kind::release;
        break;
    case QEvent::TouchCancel:
        kind = Kind::cancel;
        break;
    default:
        return false;
    }
    auto* const receiver = qobject_cast<QWidget*>(watched);
    const auto& pointer = static_cast<const QPointerEvent&>(*event);
    if (!receiver || !area_ || !isFinger(pointer) || pointer.pointCount() == 0 ||
        (receiver != area_ && !area_->isAncestorOf(receiver)))
        return false;
    const QEventPoint& point = pointer.points().constFirst();
    const bool byTouch = event->type() == QEvent::TouchBegin ||
                         event->type() == QEvent::TouchUpdate ||
                         event->type() == QEvent::TouchEnd || event->type() == QEvent::TouchCancel;
    return handle({*kind, area_->mapFromGlobal(point.globalPosition()),
                   static_cast<qint64>(pointer.timestamp()), byTouch},
                  receiver);
}

bool EdgeSwipe::handle(const Finger& finger, QWidget* receiver) {
    switch (finger.kind) {
    case Kind::press:
        press(finger, receiver);
        return false;
    case Kind::move:
        return move(finger);
    case Kind::release:
    case Kind::cancel:
        return release(finger);
    }
    return false;
}

void EdgeSwipe::press(const Finger& finger, QWidget* receiver) {
    // The same press comes once for every widget above the first that leaves it alone.
    if (phase_ != Phase::idle)
        return;
    const double fromEdge =
        isRightToLeft() ? area_->width() - finger.position.x() : finger.position.x();
    if (fromEdge < 0 || fromEdge > edgeWidth || !handlers_.mayBegin())
        return;
    phase_ = Phase::candidate;
    pressed_ = receiver;
    start_ = last_ = finger.position;
    lastTime_ = finger.time;
    speed_ = 0;
}

bool EdgeSwipe::move(const Finger& finger) {
    if (phase_ == Phase::idle)
        return false;
    const double inward = distance(finger.position);
    if (phase_ == Phase::candidate) {
        const double across = std::abs(finger.position.y() - start_.y());
        if (across > slop && across > inward)
            phase_ = Phase::idle;
        if (phase_ == Phase::idle || inward < slop)
            return false;
        phase_ = Phase::swiping;
        takeOver(finger.byTouch);
        handlers_.began();
    }
    if (finger.time > lastTime_) {
        const double step = distance(finger.position) - distance(last_);
        speed_ = step * 1000 / static_cast<double>(finger.time - lastTime_);
        last_ = finger.position;
        lastTime_ = finger.time;
    }
    handlers_.moved(std::clamp(inward / std::max(1, area_->width()), 0.0, 1.0));
    return true;
}

bool EdgeSwipe::release(const Finger& finger) {
    const Phase former = std::exchange(phase_, Phase::idle);
    if (former != Phase::swiping)
        return false;
    const double share = distance(finger.position) / std::max(1, area_->width());
    handlers_.ended(finger.kind != Kind::cancel && speed_ > -fastEnough &&
                    (share > farEnough || speed_ > fastEnough));
    return true;
}

/// Takes the press back from whoever got it, so that lifting the finger presses nothing.
void EdgeSwipe::takeOver(bool byTouch) {
    if (!pressed_)
        return;
    if (byTouch) {
        QTouchEvent cancel(QEvent::TouchCancel);
        QCoreApplication::sendEvent(pressed_, &cancel);
        return;
    }
    const QPointF outside(-10000, -10000);
    QMouseEvent release(QEvent::MouseButtonRelease, outside, outside, Qt::LeftButton, Qt::NoButton,
                        Qt::NoModifier);
    QCoreApplication::sendEvent(pressed_, &release);
}

double EdgeSwipe::distance(QPointF position) const {
    return (position.x() - start_.x()) * readingSign();
}

} // namespace platform
