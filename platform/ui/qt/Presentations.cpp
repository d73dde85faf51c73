#include "platform/ui/qt/Presentations.h"

#include "platform/base/Log.h"
#include "platform/ui/Theme.h"
#include "platform/ui/ViewControllerImpl.h"
#include "platform/ui/Window.h"
#include "platform/ui/qt/ViewImpl.h"
#include "platform/ui/qt/WindowImpl.h"

#include <QApplication>

#include <QWidget>

#include <algorithm>
#include <utility>

namespace platform {
namespace {

std::shared_ptr<View> makeHost(bool transparent) {
    auto host = std::make_shared<View>();
    host->setDebugName("presentation");
    if (!transparent)
        host->setBackgroundColor(Theme::page);
    // What the screen leaves over is nobody's below it.
    if (QWidget* const widget = host->impl().widget)
        widget->setAttribute(Qt::WA_NoMousePropagation);
    return host;
}

} // namespace

/// What lies below a screen that leaves it in sight cannot be reached: readers are told so.
void Presentations::sayWhatItIs(const Presentation& presentation, bool inForce) {
    if (presentation.covers)
        return;
    View& host = *presentation.host;
    const ViewController& screen = *presentation.screen;
    const std::string& name = screen.impl().dialogName;
    host.impl().role = inForce ? QAccessible::Dialog : QAccessible::Client;
    host.setAccessibleName(name.empty() ? screen.title() : name);
}

void Presentations::present(const std::shared_ptr<ViewController>& screen, bool animated,
                            Completion completion) {
    if (!screen || screen->parentViewController() || indexOf(*screen) < chain_.size()) {
        platformLog(LogLevel::warning, "A screen that is shown already cannot be presented");
        return;
    }
    for (const Pointer& each : std::vector<Pointer>(leaving_))
        if (each->screen == screen)
            each->animation.finish();
    if (!chain_.empty())
        chain_.back()->animation.finish();

    const auto added = std::make_shared<Presentation>();
    added->screen = screen;
    added->focusBefore = QApplication::focusWidget();
    added->covers = !screen->impl().isOverlay &&
                    screen->modalPresentationStyle() == PresentationStyle::fullScreen;
    added->completion = std::move(completion);
    screen->impl().presentedIn = &window_;
    added->host = makeHost(screen->impl().isOverlay);
    added->host->addSubview(screen->view());
    sayWhatItIs(*added, true);
    chain_.push_back(added);
    window_.impl().addHost(added->host);
    place(*added);

    const auto covered = added->covers ? contextBelow(chain_.size() - 1) : nullptr;
    const bool moves = animated && window_.isVisible();
    if (window_.isVisible()) {
        if (covered)
            covered->impl().take(AppearanceStep::willDisappear, moves);
        screen->impl().take(AppearanceStep::willAppear, moves);
    }
    window_.layoutIfNeeded();
    if (screen->impl().takeInitialFocus)
        screen->impl().takeInitialFocus();
    else if (QWidget* const focused = QApplication::focusWidget())
        focused->clearFocus();
    animate(added, true, moves, [this, added, covered, moves] { cameIn(added, covered, moves); });
}

void Presentations::cameIn(const Pointer& presentation,
                           const std::shared_ptr<ViewController>& covered, bool animated) {
    presentation->screen->impl().take(AppearanceStep::didAppear, animated);
    if (covered) {
        covered->impl().take(AppearanceStep::didDisappear, animated);
        if (covered->isViewLoaded())
            covered->view()->setHidden(true);
    }
    if (const Completion done = std::exchange(presentation->completion, {}))
        done();
}

void Presentations::dismissFrom(ViewController& screen, bool animated, Completion completion) {
    const std::size_t own = indexOf(screen);
    // Above the root screen the chain begins; above a presented one, after it.
    const bool isPresented = own < chain_.size();
    std::size_t first = isPresented ? own + 1 : 0;
    if (first == chain_.size() && isPresented)
        first = own;
    if (first >= chain_.size()) {
        if (completion)
            completion();
        return;
    }
    // The topmost goes as the user sees it go; those below it are out of the way before.
    const auto topmost = chain_.back();
    while (first < chain_.size() && chain_[first] != topmost)
        remove(first, false, {});
    dismissOne(*topmost->screen, animated, std::move(completion));
}

void Presentations::dismissOne(ViewController& screen, bool animated, Completion completion) {
    const std::size_t index = indexOf(screen);
    if (index < chain_.size())
        remove(index, animated, std::move(completion));
    else if (completion)
        completion();
}

void Presentations::dismissAll() {
    while (!chain_.empty())
        remove(chain_.size() - 1, false, {});
    for (const Pointer& each : std::vector<Pointer>(leaving_))
        each->animation.finish();
}

void Presentations::remove(std::size_t index, bool animated, Completion completion) {
    const Pointer removed = chain_[index];
    removed->animation.finish();
    // Its completion may have changed the chain, or dismissed it already.
    index = indexOf(*removed->screen);
    if (index >= chain_.size())
        return;
    const bool isCovered =
        std::any_of(chain_.begin() + static_cast<std::ptrdiff_t>(index) + 1, chain_.end(),
                    [](const Pointer& each) { return each->covers; });
    const auto uncovered = removed->covers && !isCovered ? contextBelow(index) : nullptr;
    chain_.erase(chain_.begin() + static_cast<std::ptrdiff_t>(index));
    leaving_.push_back(removed);
    // The screen above came over one that is gone: the focus goes back to where that one took it.
    if (index < chain_.size())
        chain_[index]->focusBefore = removed->focusBefore;
    removed->completion = std::move(completion);
    removed->host->setUserInteractionEnabled(false);
    sayWhatItIs(*removed, false);

    const bool moves = animated && window_.isVisible();
    if (uncovered && uncovered->isViewLoaded())
        uncovered->view()->setHidden(false);
    removed->screen->impl().take(AppearanceStep::willDisappear, moves);
    if (uncovered && window_.isVisible())
        uncovered->impl().take(AppearanceStep::willAppear, moves);
    restoreFocus(*removed, index);
    animate(removed, false, moves,
            [this, removed, uncovered, moves] { wentOut(removed, uncovered, moves); });
}

void Presentations::wentOut(const Pointer& presentation,
                            const std::shared_ptr<ViewController>& uncovered, bool animated) {
    std::erase(leaving_, presentation);
    presentation->host->removeFromSuperview();
    presentation->screen->impl().take(AppearanceStep::didDisappear, animated);
    presentation->screen->impl().presentedIn = nullptr;
    presentation->screen->view()->removeFromSuperview();
    presentation->screen->view()->setHidden(false);
    window_.impl().restackStrip();
    if (uncovered)
        uncovered->impl().take(AppearanceStep::didAppear, animated);
    // The press that dismissed it may still be on its way through the widgets.
    keepUntilNextTurn(presentation->host);
    if (const Completion done = std::exchange(presentation->completion, {}))
        done();
}

void Presentations::animate(const Pointer& presentation, bool in, bool animated, Completion done) {
    const auto& own = presentation->screen->impl().entrance;
    const std::weak_ptr<Presentation> weak = presentation;
    const auto step = [weak, in](double progress) {
        const auto self = weak.lock();
        if (!self)
            return;
        const double shown = in ? progress : 1 - progress;
        const auto& entrance = self->screen->impl().entrance;
        if (entrance)
            entrance->step(shown);
        else
            self->host->impl().setTranslation({0, (1 - shown) * self->host->frame().height});
    };
    presentation->animation.start(animated ? (own ? own->time : Duration(Theme::pushTime))
                                           : Duration::zero(),
                                  AnimationCurve::easeOut, step, std::move(done));
}

void Presentations::restoreFocus(const Presentation& presentation, std::size_t index) const {
    // With another screen above it the focus is that screen's.
    if (index < chain_.size())
        return;
    QWidget* const before = presentation.focusBefore;
    if (before && canTakeFocus(*before))
        before->setFocus(Qt::OtherFocusReason);
    else if (QWidget* const focused = QApplication::focusWidget())
        focused->clearFocus();
}

std::size_t Presentations::indexOf(const ViewController& screen) const {
    const auto found = std::ranges::find_if(
        chain_, [&](const Pointer& each) { return each->screen.get() == &screen; });
    return static_cast<std::size_t>(found - chain_.begin());
}

std::shared_ptr<ViewController> Presentations::contextBelow(std::size_t index) const {
    while (index > 0)
        if (chain_[--index]->covers)
            return chain_[index]->screen;
    return window_.rootViewController();
}

std::shared_ptr<ViewController> Presentations::presentedBy(const ViewController& screen) const {
    const std::size_t own = indexOf(screen);
    const std::size_t next = own < chain_.size() ? own + 1 : 0;
    const bool known = own < chain_.size() || window_.rootViewController().get() == &screen;
    return known && next < chain_.size() ? chain_[next]->screen : nullptr;
}

ViewController* Presentations::presenterOf(const ViewController& screen) const {
    const std::size_t own = indexOf(screen);
    if (own >= chain_.size())
        return nullptr;
    return own > 0 ? chain_[own - 1]->screen.get() : window_.rootViewController().get();
}

std::shared_ptr<ViewController> Presentations::top() const {
    return chain_.empty() ? nullptr : chain_.back()->screen;
}

View* Presentations::topHost() const {
    return chain_.empty() ? nullptr : chain_.back()->host.get();
}

std::vector<std::shared_ptr<ViewController>> Presentations::screens() const {
    std::vector<std::shared_ptr<ViewController>> all;
    for (const Pointer& each : chain_)
        all.push_back(each->screen);
    for (const Pointer& each : leaving_)
        all.push_back(each->screen);
    return all;
}

void Presentations::place() {
    for (const Pointer& each : chain_)
        place(*each);
    for (const Pointer& each : leaving_)
        place(*each);
}

void Presentations::place(const Presentation& presentation) const {
    presentation.host->setFrame(window_.impl().wholeArea());
    const ViewController& screen = *presentation.screen;
    const bool whole = screen.impl().isOverlay || screen.extendsUnderBars();
    View& view = *presentation.screen->view();
    view.setLaidOutByConstraints(false);
    view.setFrame(whole ? window_.impl().wholeArea() : window_.impl().areaBelowStrip());
}

std::shared_ptr<View> Presentations::lastCoveringHost() const {
    for (auto each = chain_.rbegin(); each != chain_.rend(); ++each)
        if (!(*each)->screen->impl().isOverlay)
            return (*each)->host;
    return nullptr;
}

} // namespace platform
