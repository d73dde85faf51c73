#pragma once

#include <QTouchEvent>

namespace platform {

/// The event as what fingers do; none for any other.
inline QTouchEvent* touchOf(QEvent* event) {
    switch (event->type()) {
    case QEvent::TouchBegin:
    case QEvent::TouchUpdate:
    case QEvent::TouchEnd:
    case QEvent::TouchCancel:
        return static_cast<QTouchEvent*>(event);
    default:
        return nullptr;
    }
}

} // namespace platform
