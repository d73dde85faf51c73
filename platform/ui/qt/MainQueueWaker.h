#pragma once

#include "platform/base/MainQueue.h"

#include <QEvent>

#include <memory>
#include <mutex>

class QObject;

namespace platform {

/// The event by which the Qt loop is asked to drain the main queue.
QEvent::Type drainEventType();

/// Wakes the Qt loop from any thread; the main queue may hold it longer than the application lives.
class MainQueueWaker {
public:
    explicit MainQueueWaker(QObject& receiver) : receiver_(&receiver) {}
    void wake();
    /// No event is posted after this.
    void detach();

private:
    std::mutex mutex_;
    QObject* receiver_;
};

} // namespace platform
