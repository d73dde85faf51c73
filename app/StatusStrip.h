#pragma once

#include "platform/base/NotificationCenter.h"
#include "platform/system/ReachabilityService.h"
#include "platform/ui/Window.h"

#include <cstdint>
#include <memory>

namespace tavrin {

/// Keeps the strip at the top of the window true: whose store it is, how the network is, and
/// whether something uses it. Main thread.
class StatusStrip {
public:
    /// The window outlives the strip.
    explicit StatusStrip(platform::Window& window);
    ~StatusStrip();
    StatusStrip(const StatusStrip&) = delete;
    StatusStrip& operator=(const StatusStrip&) = delete;

private:
    struct Reports;
    void update();

    platform::Window& window_;
    std::shared_ptr<Reports> reports_;
    std::unique_ptr<platform::ReachabilityTarget> target_;
    platform::Observation accountChanged_;
    platform::Observation problemChanged_;
    platform::Observation activityChanged_;
};

} // namespace tavrin
