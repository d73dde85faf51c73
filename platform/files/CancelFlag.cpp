#include "platform/files/ContentProvider.h"

#include <utility>

namespace platform {

void CancelFlag::cancel() {
    cancelled_.store(true, std::memory_order_release);
    const std::lock_guard lock(mutex_);
    // Moved out first: the handler may replace itself.
    if (const std::function<void()> handler = std::exchange(handler_, nullptr))
        handler();
}

void CancelFlag::setHandler(std::function<void()> handler) {
    const std::lock_guard lock(mutex_);
    handler_ = nullptr;
    if (!handler)
        return;
    if (isCancelled())
        handler();
    else
        handler_ = std::move(handler);
}

} // namespace platform
