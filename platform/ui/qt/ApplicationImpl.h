#pragma once

#include "platform/base/Value.h"
#include "platform/ui/Application.h"

#include <QApplication>
#include <QTranslator>

#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace platform {

class MainQueue;
class MainQueueWaker;

struct Application::Impl : public QObject {
    Impl(Application& owner, int& argc, char** argv);
    ~Impl() override;

    bool eventFilter(QObject* watched, QEvent* event) override;
    bool event(QEvent* event) override;

    /// Joins the installed runtime's main queue; again when another runtime took its place.
    void attachMainQueue();
    void readEnvironment();
    void askDesktop();
    /// Every view looks again at fonts and directions.
    void settingsChanged();
    void showKeyboardFocus(bool shown);
    /// The latest of those in view; none when there is none.
    Window* visibleWindow() const;
    void saveState();
    /// After whatever may have changed what is shown (a screen that came to the top, a person's
    /// input, an address), so that a program that is killed comes back there as well.
    void saveStateSoon();
    void restoreState();

    Application& owner;
    QApplication application;
    /// The words of the toolkit's own menus.
    QTranslator toolkitTexts;
    std::shared_ptr<MainQueueWaker> waker;
    MainQueue* attachedQueue = nullptr;
    std::shared_ptr<ApplicationDelegate> delegate;
    std::vector<Window*> windows;
    bool active = false;
    bool keyboardFocus = false;
    bool pointerHovers = true;
    bool motionReduced = false;
    double scale = 1;
    /// The environment's word stands against the desktop's.
    bool motionDecided = false;
    bool scaleDecided = false;
    std::optional<DeviceIdiom> idiom;
    bool savesSoon = false;
    std::optional<Value::Map> savedState; // what the file holds; none when that is not known
};

/// None before and after the application's life.
Application::Impl* applicationImpl();

} // namespace platform
