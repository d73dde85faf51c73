#pragma once

#include "platform/base/ManualClock.h"
#include "platform/base/Runtime.h"
#include "platform/ui/Application.h"
#include "platform/ui/NavigationController.h"
#include "platform/ui/Window.h"

#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace test {

/// A runtime on a clock that stands still, and the application on it. One at a time.
class UiEnvironment {
public:
    UiEnvironment();
    ~UiEnvironment();
    UiEnvironment(const UiEnvironment&) = delete;
    UiEnvironment& operator=(const UiEnvironment&) = delete;

    /// Moves time on, frame by frame, with all that happens meanwhile.
    void advance(platform::Duration time);
    /// Runs what waits; time stands still.
    void settle();

    platform::ManualClock clock;
    platform::MainQueue mainQueue{clock};
    platform::NotificationCenter notifications;
    platform::Runtime runtime;
    std::unique_ptr<platform::Application> application;
};

} // namespace test
