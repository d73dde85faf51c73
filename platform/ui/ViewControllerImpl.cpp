#include "platform/ui/ViewControllerImpl.h"

#include "platform/ui/Window.h"

namespace platform {
namespace {

/// The state in which a step finds the screen, and the one in which it leaves it.
bool advance(Appearance& state, AppearanceStep step) {
    switch (step) {
    case AppearanceStep::willAppear:
        if (state == Appearance::appearing || state == Appearance::here)
            return false;
        state = Appearance::appearing;
        return true;
    case AppearanceStep::didAppear:
        if (state != Appearance::appearing)
            return false;
        state = Appearance::here;
        return true;
    case AppearanceStep::willDisappear:
        if (state == Appearance::leaving || state == Appearance::gone)
            return false;
        state = Appearance::leaving;
        return true;
    case AppearanceStep::didDisappear:
        if (state != Appearance::leaving)
            return false;
        state = Appearance::gone;
        return true;
    }
    return false;
}

void tell(ViewController& screen, AppearanceStep step, bool animated) {
    switch (step) {
    case AppearanceStep::willAppear:
        screen.viewWillAppear(animated);
        break;
    case AppearanceStep::didAppear:
        screen.viewDidAppear(animated);
        break;
    case AppearanceStep::willDisappear:
        screen.viewWillDisappear(animated);
        break;
    case AppearanceStep::didDisappear:
        screen.viewDidDisappear(animated);
        break;
    }
}

} // namespace

void ViewController::Impl::take(AppearanceStep step, bool animated) {
    if (!advance(state, step))
        return;
    const auto keep = self->weak_from_this().lock();
    if (step == AppearanceStep::willAppear)
        self->view();
    tell(*self, step, animated);
    if (forwardStep) {
        forwardStep(step, animated);
        return;
    }
    const std::vector<std::shared_ptr<ViewController>> together = children;
    for (const auto& child : together)
        if (child->impl().parent == self && child->isViewLoaded())
            child->impl().take(step, animated);
}

ViewController& ViewController::Impl::topAncestor() const {
    ViewController* top = self;
    while (top->impl().parent)
        top = top->impl().parent;
    return *top;
}

Window* ViewController::Impl::window() const {
    for (const ViewController* each = self; each; each = each->impl().parent) {
        const View* const shown = each->impl().loadedView();
        if (shown && shown->window())
            return shown->window();
        if (each->impl().presentedIn)
            return each->impl().presentedIn;
    }
    return nullptr;
}

void ViewController::Impl::sizeWillChange(Size size, TransitionCoordinator& coordinator) {
    if (isOnScreen())
        self->viewWillTransitionToSize(size, coordinator);
}

bool ViewController::Impl::sendKeyCommand(KeyCommand command) {
    const auto keep = self->weak_from_this().lock();
    if (visibleChild) {
        ViewController* const child = visibleChild();
        if (child && child->impl().sendKeyCommand(command))
            return true;
    } else {
        const std::vector<std::shared_ptr<ViewController>> all = children;
        for (const auto& child : all)
            if (child->impl().isOnScreen() && child->impl().sendKeyCommand(command))
                return true;
    }
    return self->performKeyCommand(command);
}

} // namespace platform
