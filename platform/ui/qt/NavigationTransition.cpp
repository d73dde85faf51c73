#include "platform/ui/Direction.h"
#include "platform/ui/Theme.h"
#include "platform/ui/Window.h"
#include "platform/ui/qt/NavigationStack.h"
#include "platform/ui/qt/ViewImpl.h"
#include "platform/ui/qt/WindowImpl.h"

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

/// The lower page goes a third of the way.
constexpr double lowerPageShare = 1.0 / 3;

bool contains(const std::vector<std::shared_ptr<ViewController>>& screens,
              const std::shared_ptr<ViewController>& screen) {
    return std::ranges::find(screens, screen) != screens.end();
}

} // namespace

void NavigationController::Stack::change(Screens wanted, bool animated) {
    finishTransition();
    const auto keep = owner.weak_from_this().lock();
    const Screens former = screens;
    const Screen from = top();
    const Screen to = wanted.empty() ? nullptr : wanted.back();
    const bool forward = !contains(former, to);
    adopt(wanted);
    screens = std::move(wanted);
    if (!pages || !isOnScreen() || from == to || !from || !to) {
        if (from != to && from && isOnScreen()) {
            from->impl().take(AppearanceStep::willDisappear, false);
            from->impl().take(AppearanceStep::didDisappear, false);
        }
        if (from != to) {
            showTop();
        } else if (to) {
            follow(to);
            updateBar();
        }
        release(former);
        if (from != to && to && isOnScreen())
            step(AppearanceStep::willAppear, false);
        if (from != to && to && owner.impl().state == Appearance::here)
            step(AppearanceStep::didAppear, false);
        return;
    }
    begin(from, to, forward, animated && owner.impl().state == Appearance::here);
    transition->former = former;
    if (announce())
        run();
}

void NavigationController::Stack::adopt(const Screens& wanted) {
    for (const Screen& each : wanted)
        if (!contains(screens, each))
            owner.addChildViewController(each);
}

/// Lets go of what is on the stack no more.
void NavigationController::Stack::release(const Screens& former) {
    for (const Screen& each : former) {
        if (contains(screens, each))
            continue;
        each->navigationItem().setChangeHandler({});
        each->impl().toolbarItemsChanged = {};
        if (each->parentViewController() == &owner)
            each->removeFromParentViewController();
    }
    const Screens now = screens;
    for (const Screen& each : now)
        if (!contains(former, each))
            each->didMoveToParent(&owner);
}

void NavigationController::Stack::begin(const Screen& from, const Screen& to, bool forward,
                                        bool animated) {
    transition = std::make_unique<Transition>();
    transition->number = ++transitionCount;
    transition->from = from;
    transition->to = to;
    transition->fromPage = topPage;
    transition->toPage = makePage(to);
    transition->forward = forward;
    transition->animated = animated;
    if (forward)
        pages->addSubview(transition->toPage);
    else
        pages->insertSubview(transition->toPage, 0);
    pages->addSubview(edge);
    edge->setHidden(!animated);
    // Neither page takes a press while they move.
    transition->fromPage->setUserInteractionEnabled(false);
    transition->toPage->setUserInteractionEnabled(false);
    layout();
}

/// Tells the screens and the delegate. False when one of them changed the stack meanwhile, which
/// brought this transition to its end.
bool NavigationController::Stack::announce() {
    const unsigned number = transition->number;
    const Screen from = transition->from;
    const Screen to = transition->to;
    const bool animated = transition->animated;
    const auto isStill = [&] { return transition && transition->number == number; };
    from->impl().take(AppearanceStep::willDisappear, animated);
    if (isStill())
        to->impl().take(AppearanceStep::willAppear, animated);
    if (const auto listener = delegate.lock(); listener && isStill())
        listener->navigationControllerWillShowViewController(owner, *to, animated);
    if (Window* const window = owner.impl().window(); window && isStill())
        window->layoutIfNeeded();
    return isStill();
}

void NavigationController::Stack::run() {
    follow(transition->to);
    updateToolbar();
    const BarEntry entry = entryFor(screens.size() - 1);
    if (transition->byFinger)
        bar->show(entry);
    else
        bar->beginTransition(entry, transition->forward);
    transition->byFinger = false;
    const double done = transition->progress;
    const auto rest = std::chrono::duration<double>(Theme::pushTime) * (1 - done);
    transition->animation.start(
        transition->animated ? std::chrono::duration_cast<Duration>(rest) : Duration::zero(),
        AnimationCurve::easeOut,
        [this, done](double progress) { showProgress(done + (1 - done) * progress); },
        [this] { end(); });
}

void NavigationController::Stack::showProgress(double progress) {
    if (!transition)
        return;
    transition->progress = progress;
    const double width = pages->bounds().width;
    const double sign = readingSign();
    const double shown = transition->forward ? progress : 1 - progress;
    View& upper = transition->forward ? *transition->toPage : *transition->fromPage;
    View& lower = transition->forward ? *transition->fromPage : *transition->toPage;
    const double x = std::round(sign * width * (1 - shown));
    upper.impl().setTranslation({x, 0});
    lower.impl().setTranslation({std::round(-sign * width * lowerPageShare * shown), 0});
    const double line = edge->frame().width;
    edge->impl().setTranslation({sign > 0 ? x - line : x + width, 0});
    bar->setProgress(progress);
    // Under a finger the toolbar still is the upper page's.
    if (!transition->byFinger)
        toolbar->setItemsAlpha(progress);
}

void NavigationController::Stack::end() {
    const std::unique_ptr<Transition> done = std::move(transition);
    if (!done)
        return;
    const auto keep = owner.weak_from_this().lock();
    topPage = done->toPage;
    topPage->impl().setTranslation({});
    topPage->setUserInteractionEnabled(true);
    done->fromPage->removeFromSuperview();
    edge->setHidden(true);
    edge->removeFromSuperview();
    bar->endTransition(true);
    toolbar->setItemsAlpha(1);
    layout();
    // A press that began the change may still be on its way through the old page.
    keepUntilNextTurn(done->fromPage);
    done->from->impl().take(AppearanceStep::didDisappear, done->animated);
    release(done->former);
    if (owner.impl().state != Appearance::here)
        return;
    done->to->impl().take(AppearanceStep::didAppear, done->animated);
    if (top() == done->to)
        didShow(done->animated);
}

void NavigationController::Stack::finishTransition() {
    if (!transition)
        return;
    if (transition->animation.isRunning())
        transition->animation.finish();
    else if (transition->byFinger)
        cancelSwipe();
    else
        end();
}

bool NavigationController::Stack::maySwipe() const {
    const Window* const window = owner.impl().window();
    return screens.size() > 1 && !transition && owner.impl().state == Appearance::here &&
           !top()->navigationItem().hidesBackButton() && window && !owner.presentedViewController();
}

void NavigationController::Stack::beginSwipe() {
    // Shown, but told to nobody: a finger that goes back leaves no trace.
    begin(top(), screens[screens.size() - 2], false, true);
    transition->byFinger = true;
    bar->beginTransition(entryFor(screens.size() - 2), false);
    if (Window* const window = owner.impl().window())
        window->layoutIfNeeded();
    showProgress(0);
}

void NavigationController::Stack::endSwipe(bool far) {
    if (!transition || !transition->byFinger)
        return;
    if (!far) {
        const double from = transition->progress;
        transition->animation.start(
            Theme::pushTime / 2, AnimationCurve::easeOut,
            [this, from](double progress) { showProgress(from * (1 - progress)); },
            [this] { cancelSwipe(); });
        return;
    }
    const auto keep = owner.weak_from_this().lock();
    transition->former = screens;
    screens.pop_back();
    if (announce())
        run();
}

void NavigationController::Stack::cancelSwipe() {
    const std::unique_ptr<Transition> done = std::move(transition);
    if (!done)
        return;
    done->toPage->removeFromSuperview();
    edge->setHidden(true);
    edge->removeFromSuperview();
    topPage = done->fromPage;
    topPage->impl().setTranslation({});
    topPage->setUserInteractionEnabled(true);
    bar->endTransition(false);
    layout();
}

} // namespace platform
