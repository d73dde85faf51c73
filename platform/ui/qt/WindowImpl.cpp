#include "platform/ui/qt/WindowImpl.h"

#include "platform/base/Identity.h"
#include "platform/base/Log.h"
#include "platform/ui/Application.h"
#include "platform/ui/Theme.h"
#include "platform/ui/ViewControllerImpl.h"
#include "platform/ui/qt/ApplicationImpl.h"
#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/ViewImpl.h"

#include <QPainter>
#include <QScreen>

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

constexpr Size defaultPhoneSize{390, 844};
constexpr Size defaultTabletSize{1024, 768};
/// A phone's smallest screen, upright; turned it is as small the other way.
constexpr int smallestShortSide = 320;
constexpr int smallestLongSide = 480;
/// Layout that asks for layout comes to rest in two or three rounds; more is a fault of a view.
constexpr int layoutRounds = 10;

/// A window as large as the screen is what a device wants; on a desk it becomes a device's size.
Size initialSize(Rect wanted) {
    const Application& application = Application::shared();
    const Rect screen = application.mainScreenBounds();
    const bool whole = wanted.width <= 0 || wanted.height <= 0 ||
                       (wanted.width == screen.width && wanted.height == screen.height);
    const Size device =
        application.idiom() == DeviceIdiom::phone ? defaultPhoneSize : defaultTabletSize;
    Size size = whole ? device : wanted.size();
    if (const QScreen* const real = QGuiApplication::primaryScreen(); real && whole) {
        const QSize room = real->availableGeometry().size();
        size.width = std::min(size.width, static_cast<double>(room.width()));
        size.height = std::min(size.height, static_cast<double>(room.height()));
    }
    return size;
}

/// Collects what goes beside a change of size, which happens at once.
class ResizeCoordinator : public TransitionCoordinator {
public:
    void animateAlongside(std::function<void()> animation,
                          std::function<void()> completion) override {
        if (animation)
            animations_.push_back(std::move(animation));
        if (completion)
            completions_.push_back(std::move(completion));
    }
    void runAnimations() { run(animations_); }
    void runCompletions() { run(completions_); }

private:
    static void run(std::vector<std::function<void()>>& blocks) {
        for (const auto& block : std::exchange(blocks, {}))
            block();
    }

    std::vector<std::function<void()>> animations_;
    std::vector<std::function<void()>> completions_;
};

} // namespace

Window::Impl::Impl(Window& theOwner, Rect wanted)
    : owner(theOwner),
      widget(new WindowWidget(theOwner)),
      rootView(std::make_shared<View>()),
      strip(std::make_shared<StatusStrip>()),
      presentations(theOwner) {
    rootView->setDebugName("window");
    rootView->setBackgroundColor(Theme::page);
    rootView->addSubview(strip);
    rootView->impl().widget->setParent(widget);
    rootView->impl().widget->show();
    widget->setWindowTitle(toQt(applicationName));
    resize(initialSize(wanted));
    size = {static_cast<double>(widget->width()), static_cast<double>(widget->height())};
    engine.setRightToLeft(Application::shared().isRightToLeft());
    engine.setOnNeedsSolve([this] { scheduleLayout(); });
}

Window::Impl::~Impl() {
    if (!widget)
        return;
    widget->detach();
    if (rootView->impl().widget)
        rootView->impl().widget->setParent(nullptr);
    delete widget.data();
}

void Window::Impl::resize(Size wanted) {
    if (!widget)
        return;
    const bool turned = wanted.width > wanted.height;
    const int width = turned ? smallestLongSide : smallestShortSide;
    const int height = turned ? smallestShortSide : smallestLongSide;
    // The minimum of the former orientation must not stand in the way.
    if (widget->minimumWidth() != width)
        widget->setMinimumSize(smallestShortSide, smallestShortSide);
    widget->resize(std::max(width, static_cast<int>(wanted.width)),
                   std::max(height, static_cast<int>(wanted.height)));
    applyMinimum(wanted);
}

void Window::Impl::applyMinimum(Size now) {
    const bool turned = now.width > now.height;
    const QSize least(turned ? smallestLongSide : smallestShortSide,
                      turned ? smallestShortSide : smallestLongSide);
    if (widget->minimumSize() != least)
        widget->setMinimumSize(least);
}

void Window::Impl::scheduleLayout() {
    if (widget)
        widget->postLayout();
}

bool Window::Impl::layout() {
    if (inLayout || !rootView)
        return false;
    inLayout = true;
    int round = 0;
    for (; round < layoutRounds; ++round) {
        if (!engine.needsSolve() && !rootView->impl().treeNeedsLayout)
            break;
        engine.solve();
        rootView->impl().runLayoutSubviews();
    }
    inLayout = false;
    if (round == layoutRounds)
        platformLog(LogLevel::warning, "The layout of a window does not come to rest");
    return round > 0;
}

void Window::Impl::place() {
    rootView->setFrame(wholeArea());
    strip->setFrame({0, 0, size.width, StatusStrip::height()});
    if (root && root->isViewLoaded())
        root->view()->setFrame(root->extendsUnderBars() ? wholeArea() : areaBelowStrip());
    presentations.place();
}

void Window::Impl::sizeChanged() {
    if (!widget)
        return;
    const Size now{static_cast<double>(widget->width()), static_cast<double>(widget->height())};
    ResizeCoordinator coordinator;
    if (!(now == size)) {
        if (root)
            root->impl().sizeWillChange(now, coordinator);
        for (const auto& screen : presentations.screens())
            screen->impl().sizeWillChange(now, coordinator);
    }
    size = now;
    applyMinimum(size);
    engine.setRootSize(size);
    place();
    coordinator.runAnimations();
    // The widget is painted in this same turn; it must not be painted as it was.
    layout();
    coordinator.runCompletions();
}

void Window::Impl::screenChanged() {
    if (widget)
        engine.setPixelsPerPoint(widget->devicePixelRatioF());
}

void Window::Impl::settingsChanged() {
    engine.setRightToLeft(Application::shared().isRightToLeft());
    place();
    rootView->impl().settingsChangedInTree();
    scheduleLayout();
}

void Window::Impl::show() {
    if (!widget)
        return;
    if (visible) {
        widget->setWindowState(widget->windowState() & ~Qt::WindowMinimized);
        widget->raise();
        widget->activateWindow();
        return;
    }
    visible = true;
    std::vector<std::shared_ptr<ViewController>> shown = presentations.screens();
    if (root && !presentations.lastCoveringHost())
        shown.insert(shown.begin(), root);
    for (const auto& screen : shown)
        screen->impl().take(AppearanceStep::willAppear, false);
    layout();
    widget->show();
    widget->activateWindow();
    for (const auto& screen : shown)
        screen->impl().take(AppearanceStep::didAppear, false);
}

void Window::Impl::willClose() {
    if (!visible)
        return;
    visible = false;
    std::vector<std::shared_ptr<ViewController>> shown = presentations.screens();
    shown.insert(shown.begin(), root);
    for (const AppearanceStep step : {AppearanceStep::willDisappear, AppearanceStep::didDisappear})
        for (const auto& screen : shown)
            if (screen)
                screen->impl().take(step, false);
}

void Window::Impl::addHost(const std::shared_ptr<View>& host) {
    rootView->addSubview(host);
    restackStrip();
}

void Window::Impl::restackStrip() {
    const std::shared_ptr<View> below = presentations.lastCoveringHost();
    const auto& all = rootView->subviews();
    const auto place = std::ranges::find(all, below ? below : root ? root->view() : nullptr);
    const auto wanted = place == all.end() ? 0 : static_cast<std::size_t>(place - all.begin()) + 1;
    if (wanted < all.size() && all[wanted] == strip)
        return;
    strip->removeFromSuperview();
    const auto again = std::ranges::find(all, below ? below : root ? root->view() : nullptr);
    const auto index = again == all.end() ? 0 : static_cast<std::size_t>(again - all.begin()) + 1;
    rootView->insertSubview(strip, index);
}

Rect Window::Impl::wholeArea() const {
    return {0, 0, size.width, size.height};
}

Rect Window::Impl::areaBelowStrip() const {
    const double top = StatusStrip::height();
    return {0, top, size.width, std::max(0.0, size.height - top)};
}

bool Window::Impl::sendKeyCommand(KeyCommand command) {
    const auto screen = presentations.top() ? presentations.top() : root;
    return screen && screen->impl().sendKeyCommand(command);
}

const QWidget& Window::Impl::focusScope() const {
    const View* const host = presentations.topHost();
    const QWidget* const scope = host ? widgetOf(*host) : nullptr;
    return scope ? *scope : *widget;
}

QImage Window::Impl::picture(double scale) const {
    QImage image(static_cast<int>(std::lround(size.width * scale)),
                 static_cast<int>(std::lround(size.height * scale)),
                 QImage::Format_ARGB32_Premultiplied);
    image.setDevicePixelRatio(scale);
    image.fill(Qt::white);
    if (widget)
        widget->render(&image, QPoint(), QRegion(), QWidget::DrawChildren);
    return image;
}

} // namespace platform
