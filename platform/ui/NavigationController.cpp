#include "platform/ui/NavigationController.h"

#include "platform/base/Log.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/NavigationStack.h"
#include "platform/ui/qt/ViewImpl.h"

#include <algorithm>

namespace platform {

NavigationController::NavigationController() : stack_(std::make_unique<Stack>(*this)) {
    setExtendsUnderBars(true);
    impl().forwardStep = [this](AppearanceStep step, bool animated) {
        stack_->step(step, animated);
    };
    impl().visibleChild = [this] { return stack_->top().get(); };
}

NavigationController::~NavigationController() {
    for (const auto& screen : stack_->screens) {
        screen->navigationItem().setChangeHandler({});
        screen->impl().toolbarItemsChanged = {};
    }
}

const std::vector<std::shared_ptr<ViewController>>& NavigationController::viewControllers() const {
    return stack_->screens;
}

void NavigationController::setViewControllers(std::vector<std::shared_ptr<ViewController>> screens,
                                              bool animated) {
    stack_->change(std::move(screens), animated);
}

void NavigationController::pushViewController(std::shared_ptr<ViewController> screen,
                                              bool animated) {
    auto screens = stack_->screens;
    if (!screen || std::ranges::find(screens, screen) != screens.end()) {
        platformLog(LogLevel::warning, "A screen that is on the stack cannot be pushed again");
        return;
    }
    screens.push_back(std::move(screen));
    stack_->change(std::move(screens), animated);
}

std::shared_ptr<ViewController> NavigationController::popViewController(bool animated) {
    auto screens = stack_->screens;
    if (screens.size() < 2)
        return nullptr;
    auto popped = screens.back();
    screens.pop_back();
    stack_->change(std::move(screens), animated);
    return popped;
}

std::shared_ptr<ViewController> NavigationController::topViewController() const {
    return stack_->top();
}

void NavigationController::setDelegate(std::weak_ptr<NavigationControllerDelegate> delegate) {
    stack_->delegate = std::move(delegate);
}

Rect NavigationController::navigationBarFrame() const {
    return stack_->barFrame();
}

Rect NavigationController::toolbarFrame() const {
    return stack_->toolbarFrame();
}

bool NavigationController::isToolbarHidden() const {
    return stack_->toolbarHidden;
}

void NavigationController::setToolbarHidden(bool hidden, bool animated) {
    Stack& stack = *stack_;
    if (stack.toolbarHidden == hidden)
        return;
    stack.toolbarHidden = hidden;
    if (!stack.toolbar)
        return;
    stack.toolbar->setHidden(false);
    stack.layout();
    const auto slide = [&stack, hidden](double progress) {
        const double away = (hidden ? progress : 1 - progress) * Toolbar::height();
        stack.toolbar->impl().setTranslation({0, away});
    };
    stack.toolbarSlide.start(
        animated && stack.isOnScreen() ? Duration(Theme::pushTime) : Duration::zero(),
        AnimationCurve::easeOut, slide, [&stack, hidden] { stack.toolbar->setHidden(hidden); });
}

bool NavigationController::performKeyCommand(KeyCommand command) {
    if (command != KeyCommand::back || stack_->screens.size() < 2 ||
        stack_->top()->navigationItem().hidesBackButton())
        return ViewController::performKeyCommand(command);
    popViewController(true);
    return true;
}

void NavigationController::loadView() {
    ViewController::loadView();
    stack_->build(*view());
}

void NavigationController::viewDidLayoutSubviews() {
    ViewController::viewDidLayoutSubviews();
    stack_->layout();
}

} // namespace platform
