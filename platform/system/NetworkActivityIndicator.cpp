#include "platform/system/NetworkActivityIndicator.h"

#include "platform/base/Runtime.h"

namespace platform {

void NetworkActivityIndicator::setVisible(bool visible) {
    if (visible_.exchange(visible, std::memory_order_acq_rel) == visible || !Runtime::installed())
        return;
    Runtime& runtime = Runtime::current();
    runtime.mainQueue.async([&notifications = runtime.notifications] {
        notifications.post(networkActivityIndicatorDidChangeNotification);
    });
}

} // namespace platform
