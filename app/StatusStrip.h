#pragma once

#include "platform/base/MainQueue.h"
#include "platform/base/NotificationCenter.h"
#include "platform/base/WorkQueue.h"
#include "platform/system/ReachabilityService.h"
#include "platform/ui/Window.h"

#include <cstdint>
#include <memory>
#include <string>

namespace tavrin {

/// Keeps the strip at the top of the window true: whose store it is, what is on its way or what
/// keeps it from that, how the network is, and whether something uses it. Main thread.
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
    /// What is on its way, a little later: what takes a moment alone is not worth a word.
    void updateActivity();
    /// Asks the store what waits; the answer comes later.
    void askWhatWaits();

    platform::Window& window_;
    std::shared_ptr<Reports> reports_;
    std::unique_ptr<platform::ReachabilityTarget> target_;
    std::shared_ptr<platform::WorkQueue> queue_; // of reports, and of questions to the store
    platform::Observation accountChanged_;
    platform::Observation problemChanged_;
    platform::Observation activityChanged_;
    platform::Observation transfersChanged_;
    platform::Timer activityTimer_;
    std::string activity_;
    std::string waiting_;
};

} // namespace tavrin
