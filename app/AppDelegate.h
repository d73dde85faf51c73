#pragma once

#include "app/PasswordPrompt.h"
#include "app/StatusStrip.h"
#include "app/VanishedItems.h"
#include "platform/ui/Application.h"
#include "platform/ui/Window.h"

#include <memory>
#include <string>

namespace tavrin {

class NavController;

/// The application's delegate: makes the window, and is the entry of the URL scheme "tavrinapp".
/// Lives for the whole process. Main thread.
class AppDelegate : public platform::ApplicationDelegate {
public:
    /// Starts the network watcher, then makes the window and its root screen.
    bool applicationWillFinishLaunchingWithOptions(platform::Application& application,
                                                   const platform::LaunchOptions& options) override;
    /// Shows the store item that the URL names. Answers whether its list stack was built; only the
    /// home screen and the test runner may ask.
    bool applicationOpenURLOptions(platform::Application& application, const std::string& url,
                                   const platform::OpenUrlOptions& options) override;
    /// State is kept only while an account is signed in.
    bool applicationShouldSaveApplicationState(platform::Application& application) override;
    bool applicationShouldRestoreApplicationState(platform::Application& application) override;
    platform::Window* mainWindow() const override { return rootWindow(); }
    /// None before the launch.
    platform::Window* rootWindow() const { return rootWindow_.get(); }

private:
    std::shared_ptr<NavController> rootScreen() const;

    std::unique_ptr<platform::Window> rootWindow_;
    std::unique_ptr<StatusStrip> statusStrip_; // shows itself in the window
    std::unique_ptr<VanishedItems> vanishedItems_;
    std::unique_ptr<PasswordPrompt> passwordPrompt_;
};

} // namespace tavrin
