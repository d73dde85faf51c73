#pragma once

#include "platform/base/MainQueue.h"
#include "platform/base/NotificationCenter.h"
#include "platform/ui/Window.h"

#include <memory>

namespace platform {
class AlertController;
}

namespace tavrin {

/// Asks for the account's password when its server has refused the one that is kept: once, and
/// again whenever the program becomes active. Until then the account waits, and the status strip
/// says why. Main thread.
class PasswordPrompt {
public:
    /// The window outlives it.
    explicit PasswordPrompt(platform::Window& window);
    ~PasswordPrompt();
    PasswordPrompt(const PasswordPrompt&) = delete;
    PasswordPrompt& operator=(const PasswordPrompt&) = delete;

private:
    void update();

    platform::Window& window_;
    std::weak_ptr<platform::AlertController> alert_;
    bool asked_ = false;
    platform::Timer retry_;
    platform::Observation problemChanged_;
    platform::Observation becameActive_;
};

} // namespace tavrin
