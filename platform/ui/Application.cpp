#include "platform/ui/Application.h"

#include "platform/base/Describe.h"
#include "platform/base/Identity.h"
#include "platform/base/Process.h"
#include "platform/base/Runtime.h"
#include "platform/ui/Window.h"
#include "platform/ui/qt/ApplicationImpl.h"
#include "platform/ui/qt/WindowImpl.h"

#include <QScreen>

#include <algorithm>
#include <cstdio>
#include <cstdlib>

namespace platform {
namespace {

/// A shorter side from here on makes a screen a tablet's.
constexpr double smallestTabletSide = 600;

Application* sharedApplication = nullptr;

} // namespace

Application::Impl* applicationImpl() {
    return sharedApplication ? sharedApplication->impl() : nullptr;
}

Application::Application(int& argc, char** argv) {
    sharedApplication = this;
    impl_ = std::make_unique<Impl>(*this, argc, argv);
}

Application::~Application() {
    // The screens hear of their end while there still is an application to ask.
    const std::vector<Window*> windows = impl_->windows;
    for (Window* const window : windows)
        window->impl().willClose();
    if (Runtime::installed())
        Runtime::current().notifications.post(applicationWillTerminateNotification);
    impl_->delegate.reset();
    impl_.reset();
    sharedApplication = nullptr;
}

Application& Application::shared() {
    if (!sharedApplication) {
        std::fputs("platform: the application was used before it was made\n", stderr);
        std::abort();
    }
    return *sharedApplication;
}

int Application::run(const std::shared_ptr<ApplicationDelegate>& delegate) {
    launch(delegate);
    return exec();
}

void Application::launch(const std::shared_ptr<ApplicationDelegate>& delegate) {
    impl_->delegate = delegate;
    impl_->attachMainQueue();
    const LaunchOptions options;
    delegate->applicationWillFinishLaunchingWithOptions(*this, options);
    if (delegate->applicationShouldRestoreApplicationState(*this))
        impl_->restoreState();
    delegate->applicationDidFinishLaunchingWithOptions(*this, options);
}

int Application::exec() {
    const int status = QApplication::exec();
    setActive(false);
    return status;
}

void Application::terminate(int status) {
    QApplication::exit(status);
}

bool Application::openUrl(const std::string& url, const OpenUrlOptions& options) {
    if (!impl_->delegate || !impl_->delegate->applicationOpenURLOptions(*this, url, options))
        return false;
    impl_->saveStateSoon();
    return true;
}

void Application::bringForward(const std::string& activationToken) {
    Window* const window = impl_->visibleWindow();
    if (!window)
        return;
    // There the toolkit looks for it, when it asks for the focus, and takes it away.
    if (!activationToken.empty() && QGuiApplication::platformName() == QLatin1String("wayland"))
        setEnvironmentVariable("XDG_ACTIVATION_TOKEN", activationToken);
    window->makeKeyAndVisible();
    if (!isActive())
        QApplication::alert(window->impl().widget);
}

bool Application::isActive() const {
    return impl_->active;
}

void Application::setActive(bool active) {
    if (impl_->active == active)
        return;
    impl_->active = active;
    if (active) {
        impl_->askDesktop();
        Runtime::current().notifications.post(applicationDidBecomeActiveNotification);
        return;
    }
    if (impl_->delegate)
        impl_->delegate->applicationWillResignActive(*this);
    Runtime::current().notifications.post(applicationWillResignActiveNotification);
    impl_->saveState();
}

Rect Application::mainScreenBounds() const {
    const QScreen* const screen = QGuiApplication::primaryScreen();
    if (!screen)
        return {};
    const QSize size = screen->size();
    return {0, 0, static_cast<double>(size.width()), static_cast<double>(size.height())};
}

double Application::mainScreenScale() const {
    const QScreen* const screen = QGuiApplication::primaryScreen();
    return screen ? screen->devicePixelRatio() : 1;
}

Rect Application::statusBarFrame() const {
    const Window* const window = impl_->visibleWindow();
    return window ? window->statusBarFrame() : Rect{};
}

Orientation Application::statusBarOrientation() const {
    const Window* const window = impl_->visibleWindow();
    return window ? window->orientation() : Orientation::unknown;
}

DeviceIdiom Application::idiom() const {
    if (impl_->idiom)
        return *impl_->idiom;
    const Rect screen = mainScreenBounds();
    return std::min(screen.width, screen.height) >= smallestTabletSide ? DeviceIdiom::tablet
                                                                       : DeviceIdiom::phone;
}

void Application::setIdiom(DeviceIdiom idiom) {
    impl_->idiom = idiom;
    impl_->settingsChanged();
}

bool Application::isRightToLeft() const {
    return QGuiApplication::layoutDirection() == Qt::RightToLeft;
}

void Application::setRightToLeft(bool rightToLeft) {
    QGuiApplication::setLayoutDirection(rightToLeft ? Qt::RightToLeft : Qt::LeftToRight);
    impl_->settingsChanged();
}

bool Application::reducesMotion() const {
    return impl_->motionReduced;
}

void Application::setReducesMotion(bool reduces) {
    impl_->motionReduced = reduces;
    impl_->motionDecided = true;
}

double Application::textScale() const {
    return impl_->scale;
}

void Application::setTextScale(double scale) {
    impl_->scale = scale;
    impl_->scaleDecided = true;
    impl_->settingsChanged();
}

void Application::processPending() {
    impl_->attachMainQueue();
    // Layout may post repaints, jobs may post layout: a few rounds bring all of it to rest.
    for (int round = 0; round < 4; ++round) {
        QCoreApplication::sendPostedEvents();
        QCoreApplication::processEvents();
        Runtime::current().mainQueue.drainAll();
        const std::vector<Window*> windows = impl_->windows;
        for (Window* const window : windows)
            if (std::ranges::find(impl_->windows, window) != impl_->windows.end())
                window->layoutIfNeeded();
    }
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
}

void appendDescription(std::string& out, const Application& application) {
    out += applicationName;
    out += application.isActive() ? " (active)" : " (inactive)";
}

} // namespace platform
