#include "platform/ui/qt/ApplicationImpl.h"

#include "platform/base/Identity.h"
#include "platform/base/Log.h"
#include "platform/base/Runtime.h"
#include "platform/ui/Window.h"
#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/DesktopSettings.h"
#include "platform/ui/qt/FlatStyle.h"
#include "platform/ui/qt/LiveViews.h"
#include "platform/ui/qt/MainQueueWaker.h"
#include "platform/ui/qt/RestorationFile.h"
#include "platform/ui/qt/Settings.h"
#include "platform/ui/qt/TextMetrics.h"
#include "platform/ui/qt/ViewImpl.h"
#include "platform/ui/qt/ViewWidget.h"
#include "platform/ui/qt/WindowImpl.h"
#include "resources/Resources.h"

#include <QIcon>
#include <QKeyEvent>
#include <QLocale>
#include <QMouseEvent>
#include <QPointingDevice>
#include <QStandardPaths>

#include <algorithm>
#include <utility>

namespace platform {
namespace {

constexpr double smallestTextScale = 0.5;
constexpr double largestTextScale = 4;
/// How long a screen is at the top before the program comes back to it.
constexpr Duration stateSettlingTime = std::chrono::seconds(2);

/// Runs before QApplication reads the desktop's look.
char** withoutDesktopLook(char** argv) {
    QApplication::setDesktopSettingsAware(false);
    return argv;
}

/// The user's icon theme with Breeze behind it, also on platforms that know of no themes.
void chooseIconTheme() {
    QStringList paths = QIcon::themeSearchPaths();
    for (const QString& data :
         QStandardPaths::standardLocations(QStandardPaths::GenericDataLocation))
        if (const QString icons = data + QLatin1String("/icons"); !paths.contains(icons))
            paths.append(icons);
    QIcon::setThemeSearchPaths(paths);
    QIcon::setFallbackThemeName(QStringLiteral("breeze"));
    if (QIcon::themeName().isEmpty())
        QIcon::setThemeName(QStringLiteral("breeze"));
}

std::string restorationPath() {
    return Runtime::current().folders.state + "/" + std::string(applicationIdentifierLowercase) +
           "/restoration.json";
}

} // namespace

Application::Impl::Impl(Application& theOwner, int& argc, char** argv)
    : owner(theOwner), application(argc, withoutDesktopLook(argv)) {
    initializeResources();
    QApplication::setApplicationName(toQt(applicationName));
    QApplication::setDesktopFileName(toQt(applicationIdentifier));
    QApplication::setStyle(new FlatStyle);
    QApplication::setPalette(themePalette());
    chooseFontFamilies();
    readEnvironment();
    QApplication::setFont(toQt(Font::preferred(TextStyle::body)));
    chooseIconTheme();
    QApplication::setWindowIcon(QIcon(QStringLiteral(":/icons/Tavrin.svg")));
    if (toolkitTexts.load(QLocale(), QStringLiteral("tavrin"), QStringLiteral("_"),
                          QStringLiteral(":/i18n")))
        QCoreApplication::installTranslator(&toolkitTexts);
    QGuiApplication::setLayoutDirection(QLocale().textDirection());
    installAccessibility();
    application.installEventFilter(this);
    QObject::connect(
        &application, &QGuiApplication::applicationStateChanged, this,
        [this](Qt::ApplicationState state) { owner.setActive(state == Qt::ApplicationActive); });
    attachMainQueue();
    askDesktop();
}

Application::Impl::~Impl() {
    application.removeEventFilter(this);
    QObject::disconnect(&application, nullptr, this, nullptr);
    waker->detach();
    if (Runtime::installed() && &Runtime::current().mainQueue == attachedQueue)
        attachedQueue->setWake({});
    // What was kept for the end of an event goes while there still is a loop to go with.
    QCoreApplication::sendPostedEvents();
    destroyWidgetsOfLiveViews();
}

bool Application::Impl::event(QEvent* event) {
    if (event->type() != drainEventType())
        return QObject::event(event);
    if (Runtime::installed() && Runtime::current().mainQueue.drain())
        waker->wake();
    return true;
}

bool Application::Impl::eventFilter(QObject* watched, QEvent* event) {
    switch (event->type()) {
    case QEvent::KeyPress: {
        // A letter typed with the pointer's focus needs no ring; moving about by keys does.
        const auto key = static_cast<QKeyEvent*>(event)->key();
        if (key == Qt::Key_Tab || key == Qt::Key_Backtab || key == Qt::Key_Return ||
            key == Qt::Key_Escape || (key >= Qt::Key_Home && key <= Qt::Key_PageDown))
            showKeyboardFocus(true);
        break;
    }
    case QEvent::TouchBegin:
        pointerHovers = false;
        showKeyboardFocus(false);
        break;
    case QEvent::MouseButtonPress:
        showKeyboardFocus(false);
        break;
    case QEvent::MouseMove:
        // A finger's touches arrive as moves of a mouse as well.
        if (const auto* const device = static_cast<QMouseEvent*>(event)->pointingDevice())
            pointerHovers = device->type() != QInputDevice::DeviceType::TouchScreen;
        break;
    case QEvent::KeyRelease:
    case QEvent::MouseButtonRelease:
    case QEvent::TouchEnd:
        saveStateSoon();
        break;
    default:
        break;
    }
    return QObject::eventFilter(watched, event);
}

void Application::Impl::attachMainQueue() {
    if (!waker)
        waker = std::make_shared<MainQueueWaker>(*this);
    if (!Runtime::installed() || attachedQueue == &Runtime::current().mainQueue)
        return;
    attachedQueue = &Runtime::current().mainQueue;
    savesSoon = false;
    savedState.reset();
    attachedQueue->setWake([shared = waker] { shared->wake(); });
}

void Application::Impl::readEnvironment() {
    const QString device = qEnvironmentVariable("PELMORA_DEVICE");
    if (device == QLatin1String("phone"))
        idiom = DeviceIdiom::phone;
    else if (device == QLatin1String("tablet"))
        idiom = DeviceIdiom::tablet;
    if (qEnvironmentVariableIsSet("PELMORA_REDUCE_MOTION")) {
        motionReduced = qEnvironmentVariable("PELMORA_REDUCE_MOTION") == QLatin1String("1");
        motionDecided = true;
    }
    bool isNumber = false;
    const double wanted = qEnvironmentVariable("PELMORA_TEXT_SCALE").toDouble(&isNumber);
    if (isNumber && wanted >= smallestTextScale && wanted <= largestTextScale) {
        scale = wanted;
        scaleDecided = true;
    }
}

void Application::Impl::askDesktop() {
    askDesktopSettings(*this, [this](const DesktopSettings& answer) {
        if (answer.reducesMotion && !motionDecided)
            motionReduced = *answer.reducesMotion;
        if (!answer.textScale || scaleDecided || *answer.textScale == scale ||
            *answer.textScale < smallestTextScale || *answer.textScale > largestTextScale)
            return;
        scale = *answer.textScale;
        settingsChanged();
    });
}

void Application::Impl::settingsChanged() {
    QApplication::setFont(toQt(Font::preferred(TextStyle::body)));
    const std::vector<Window*> all = windows;
    for (Window* const window : all)
        window->impl().settingsChanged();
}

void Application::Impl::showKeyboardFocus(bool shown) {
    if (keyboardFocus == shown)
        return;
    keyboardFocus = shown;
    if (QWidget* const focused = QApplication::focusWidget())
        focused->update();
}

Window* Application::Impl::visibleWindow() const {
    const auto found = std::find_if(windows.rbegin(), windows.rend(),
                                    [](const Window* each) { return each->isVisible(); });
    return found == windows.rend() ? nullptr : *found;
}

void Application::Impl::saveState() {
    Window* const window = delegate ? delegate->mainWindow() : nullptr;
    const auto root = window ? window->rootViewController() : nullptr;
    if (!root || root->restorationIdentifier().empty())
        return;
    Value::Map file;
    if (delegate->applicationShouldSaveApplicationState(owner)) {
        RestorationCoder coder;
        root->encodeRestorableStateWithCoder(coder);
        file.emplace(root->restorationIdentifier(), std::move(coder));
    }
    if (savedState == file)
        return;
    savedState.reset();
    if (const Failure failure = writeRestorationFile(restorationPath(), file))
        platformLog(LogLevel::warning, "Could not save the state of the screens: %@", *failure);
    else
        savedState = std::move(file);
}

void Application::Impl::saveStateSoon() {
    if (!Runtime::installed() || std::exchange(savesSoon, true))
        return;
    Runtime::current().mainQueue.after(stateSettlingTime, [] {
        if (Impl* const impl = applicationImpl(); impl && std::exchange(impl->savesSoon, false))
            impl->saveState();
    });
}

void Application::Impl::restoreState() {
    Window* const window = delegate->mainWindow();
    const auto root = window ? window->rootViewController() : nullptr;
    if (!root || root->restorationIdentifier().empty())
        return;
    const Value::Map file = readRestorationFile(restorationPath());
    // A screen that ends the program must not do so at every start: what is shown for a while is
    // saved again.
    savedState.reset();
    if (!file.empty())
        if (const Failure failure = writeRestorationFile(restorationPath(), {}))
            platformLog(LogLevel::warning, "Could not reset the state of the screens: %@",
                        *failure);
    const auto found = file.find(root->restorationIdentifier());
    if (found != file.end() && found->second.map())
        root->decodeRestorableStateWithCoder(*found->second.map());
}

bool reducesMotion() {
    const Application::Impl* const impl = applicationImpl();
    return impl && impl->motionReduced;
}

bool isRightToLeft() {
    return QGuiApplication::layoutDirection() == Qt::RightToLeft;
}

double textScale() {
    const Application::Impl* const impl = applicationImpl();
    return impl ? impl->scale : 1;
}

bool pointerHovers() {
    const Application::Impl* const impl = applicationImpl();
    return !impl || impl->pointerHovers;
}

bool showsKeyboardFocus() {
    const Application::Impl* const impl = applicationImpl();
    return impl && impl->keyboardFocus;
}

} // namespace platform
