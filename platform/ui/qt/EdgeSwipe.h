#pragma once

#include <QObject>
#include <QPointF>
#include <QPointer>

#include <functional>

class QWidget;

namespace platform {

/// Watches a widget for a finger that is drawn inward from the leading edge of it. A finger only: a
/// mouse has the back button. What lies under the finger gets its press taken back when the swipe
/// begins.
class EdgeSwipe : public QObject {
public:
    struct Handlers {
        /// Whether a swipe may begin now.
        std::function<bool()> mayBegin;
        std::function<void()> began;
        /// How far the finger is, 0 to 1 of the widget's width.
        std::function<void(double progress)> moved;
        /// The finger was lifted; `far` says whether it was drawn far or fast enough.
        std::function<void(bool far)> ended;
    };

    EdgeSwipe(QWidget& area, Handlers handlers);
    ~EdgeSwipe() override;

    bool eventFilter(QObject* watched, QEvent* event) override;

private:
    enum class Phase { idle, candidate, swiping };
    enum class Kind { press, move, release, cancel };
    struct Finger {
        Kind kind;
        QPointF position; // in the area
        qint64 time;      // milliseconds
        bool byTouch;     // a touch event; else the mouse event that stands for one
    };

    bool handle(const Finger& finger, QWidget* receiver);
    void press(const Finger& finger, QWidget* receiver);
    bool move(const Finger& finger);
    bool release(const Finger& finger);
    void takeOver(bool byTouch);
    double distance(QPointF position) const;

    QPointer<QWidget> area_;
    Handlers handlers_;
    Phase phase_ = Phase::idle;
    QPointer<QWidget> pressed_;
    QPointF start_;
    QPointF last_;
    qint64 lastTime_ = 0;
    double speed_ = 0; // points a second, inward
};

} // namespace platform
