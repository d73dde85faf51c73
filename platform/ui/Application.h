#pragma once

#include "platform/base/Url.h"
#include "platform/base/Value.h"
#include "platform/ui/Geometry.h"
#include "platform/ui/Traits.h"

#include <functional>
#include <memory>
#include <string>
#include <string_view>

namespace platform {

class Application;
class Window;

/// Posted on the main thread each time the program's window gains or is about to lose activity.
inline constexpr std::string_view applicationDidBecomeActiveNotification =
    "ApplicationDidBecomeActiveNotification";
inline constexpr std::string_view applicationWillResignActiveNotification =
    "ApplicationWillResignActiveNotification";
/// Posted when the toolkit is about to go: shared screens and views must not outlive it.
inline constexpr std::string_view applicationWillTerminateNotification =
    "ApplicationWillTerminateNotification";

using LaunchOptions = Value::Map;
/// Options of an open request: the caller's identity under sourceApplicationKey.
using OpenUrlOptions = Value::Map;
inline constexpr std::string_view sourceApplicationKey = "SourceApplication";

/// What the application's owner decides. All on the main thread.
class ApplicationDelegate {
public:
    virtual ~ApplicationDelegate() = default;
    virtual bool applicationWillFinishLaunchingWithOptions(Application& /*application*/,
                                                           const LaunchOptions& /*options*/) {
        return true;
    }
    virtual bool applicationDidFinishLaunchingWithOptions(Application& /*application*/,
                                                          const LaunchOptions& /*options*/) {
        return true;
    }
    virtual bool applicationOpenURLOptions(Application& /*application*/, const std::string& /*url*/,
                                           const OpenUrlOptions& /*options*/) {
        return false;
    }
    virtual void applicationWillResignActive(Application& /*application*/) {}
    virtual bool applicationShouldSaveApplicationState(Application& /*application*/) {
        return false;
    }
    virtual bool applicationShouldRestoreApplicationState(Application& /*application*/) {
        return false;
    }
    /// The window whose root screen is saved and restored.
    virtual Window* mainWindow() const { return nullptr; }
};

/// The running program: the toolkit's event loop joined to the main queue, activity notices and the
/// device. One a process, made before any view and after the platform's runtime is installed.
class Application {
public:
    Application(int& argc, char** argv);
    ~Application();
    Application(const Application&) = delete;
    Application& operator=(const Application&) = delete;

    static Application& shared();

    /// Launches the delegate and runs the main loop; answers the exit status.
    int run(const std::shared_ptr<ApplicationDelegate>& delegate);
    /// The two halves of run, for hosts with a loop of their own (tests, the tour of screens).
    void launch(const std::shared_ptr<ApplicationDelegate>& delegate);
    int exec();
    void terminate(int status = 0);

    /// Hands a URL request to the delegate.
    bool openUrl(const std::string& url, const OpenUrlOptions& options);

    /// Shows the visible window before all others and asks for the focus, by the right that the
    /// desk handed to whoever asked for it ("" for none). A desk that keeps the focus where it is
    /// shows that the window wants it.
    void bringForward(const std::string& activationToken);
    bool isActive() const;
    /// Posts the matching notice when the state changes; the windows of the program call it.
    void setActive(bool active);

    /// Bounds of the main screen in points; all zero when there is none.
    Rect mainScreenBounds() const;
    double mainScreenScale() const;
    /// Of the visible window; zero and unknown when there is none.
    Rect statusBarFrame() const;
    Orientation statusBarOrientation() const;
    DeviceIdiom idiom() const;
    /// By PELMORA_DEVICE ("phone", "tablet"), else a tablet when the screen's shorter side has 600
    /// points or more.
    void setIdiom(DeviceIdiom idiom);
    bool isRightToLeft() const;
    void setRightToLeft(bool rightToLeft);
    bool reducesMotion() const;
    void setReducesMotion(bool reduces);
    /// A factor on every text style: 1 is the designed size, 2 is 200 %.
    double textScale() const;
    void setTextScale(double scale);

    /// Runs what waits in the event loop and in the main queue; for tests and the tour.
    void processPending();

    struct Impl;
    /// None while the application is being made.
    Impl* impl() const { return impl_.get(); }

private:
    std::unique_ptr<Impl> impl_;
};

void appendDescription(std::string& out, const Application& application);

} // namespace platform
