#pragma once

#include <atomic>
#include <functional>
#include <string_view>

namespace platform {

/// Posted on the main thread when the indicator was switched.
inline constexpr std::string_view networkActivityIndicatorDidChangeNotification =
    "NetworkActivityIndicatorDidChangeNotification";

/// The sign in the status strip that something is using the network. Safe from any thread.
class NetworkActivityIndicator {
public:
    bool isVisible() const { return visible_.load(std::memory_order_acquire); }
    void setVisible(bool visible);

private:
    std::atomic<bool> visible_{false};
};

} // namespace platform
