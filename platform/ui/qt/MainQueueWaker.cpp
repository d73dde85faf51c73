#include "platform/ui/qt/MainQueueWaker.h"

#include <QCoreApplication>

namespace platform {

QEvent::Type drainEventType() {
    static const auto type = static_cast<QEvent::Type>(QEvent::registerEventType());
    return type;
}

void MainQueueWaker::wake() {
    const std::lock_guard lock(mutex_);
    if (receiver_)
        QCoreApplication::postEvent(receiver_, new QEvent(drainEventType()));
}

void MainQueueWaker::detach() {
    const std::lock_guard lock(mutex_);
    receiver_ = nullptr;
}

} // namespace platform
