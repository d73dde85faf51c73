#include "platform/ui/ViewController.h"

#include "platform/base/Log.h"
#include "platform/ui/Application.h"
#include "platform/ui/NavigationController.h"
#include "platform/ui/ViewControllerImpl.h"
#include "platform/ui/Window.h"
#include "platform/ui/qt/ApplicationImpl.h"
#include "platform/ui/qt/Presentations.h"
#include "platform/ui/qt/ViewImpl.h"
#include "platform/ui/qt/WindowImpl.h"

#include <algorithm>
#include <utility>

namespace platform {

ViewController::ViewController() : impl_(std::make_unique<Impl>()) {
    impl_->self = this;
}

ViewController::~ViewController() {
    if (impl_->view && impl_->view->impl().controller == this)
        impl_->view->impl().controller = nullptr;
    for (const auto& child : impl_->children)
        child->impl().parent = nullptr;
}

std::shared_ptr<View> ViewController::view() {
    // A screen that outlived the application lost its widgets with it; the next one loads it anew.
    if (impl_->loaded && impl_->view && !impl_->view->impl().widget) {
        setView(nullptr);
        impl_->loaded = false;
    }
    // Within loadView the view under way is answered, whatever there is of it.
    if (!impl_->loaded && !impl_->loading) {
        impl_->loading = true;
        loadView();
        if (!impl_->view)
            setView(std::make_shared<View>());
        impl_->loading = false;
        impl_->loaded = true;
        viewDidLoad();
    }
    return impl_->view;
}

bool ViewController::isViewLoaded() const {
    return impl_->loaded;
}

void ViewController::setView(std::shared_ptr<View> view) {
    if (impl_->view && impl_->view->impl().controller == this)
        impl_->view->impl().controller = nullptr;
    impl_->view = std::move(view);
    if (impl_->view)
        impl_->view->impl().controller = this;
}

void ViewController::loadView() {
    setView(std::make_shared<View>());
}

void ViewController::viewDidLoad() {
}

void ViewController::viewWillAppear(bool /*animated*/) {
}

void ViewController::viewDidAppear(bool /*animated*/) {
}

void ViewController::viewWillDisappear(bool /*animated*/) {
}

void ViewController::viewDidDisappear(bool /*animated*/) {
}

void ViewController::viewDidLayoutSubviews() {
}

void ViewController::didReceiveMemoryWarning() {
}

void ViewController::viewWillTransitionToSize(Size size, TransitionCoordinator& coordinator) {
    const std::vector<std::shared_ptr<ViewController>> children = impl_->children;
    for (const auto& child : children)
        if (child->isViewLoaded())
            child->viewWillTransitionToSize(size, coordinator);
}

bool ViewController::performKeyCommand(KeyCommand /*command*/) {
    return false;
}

std::string ViewController::title() const {
    return impl_->title;
}

void ViewController::setTitle(std::string_view title) {
    impl_->title = title;
    impl_->navigationItem.setTitle(title);
}

NavigationItem& ViewController::navigationItem() {
    return impl_->navigationItem;
}

const std::vector<BarButtonItem::Pointer>& ViewController::toolbarItems() const {
    return impl_->toolbarItems;
}

void ViewController::setToolbarItems(std::vector<BarButtonItem::Pointer> items, bool animated) {
    impl_->toolbarItems = std::move(items);
    if (impl_->toolbarItemsChanged)
        impl_->toolbarItemsChanged(animated);
}

ViewController* ViewController::parentViewController() const {
    return impl_->parent;
}

const std::vector<std::shared_ptr<ViewController>>& ViewController::childViewControllers() const {
    return impl_->children;
}

void ViewController::addChildViewController(const std::shared_ptr<ViewController>& child) {
    if (child->impl().parent == this)
        return;
    child->removeFromParentViewController();
    impl_->children.push_back(child);
    child->impl().parent = this;
}

void ViewController::removeFromParentViewController() {
    ViewController* const parent = impl_->parent;
    if (!parent)
        return;
    const auto keep = weak_from_this().lock();
    impl_->take(AppearanceStep::willDisappear, false);
    impl_->take(AppearanceStep::didDisappear, false);
    impl_->parent = nullptr;
    std::erase_if(parent->impl().children, [this](const auto& each) { return each.get() == this; });
    didMoveToParent(nullptr);
}

void ViewController::didMoveToParent(ViewController* parent) {
    // A child put into a screen that is in view already appears with it at once; a navigation stack
    // tells its screens itself.
    if (!parent || parent != impl_->parent || parent->impl().forwardStep)
        return;
    if (parent->impl().isOnScreen() && impl_->view && impl_->view->window())
        impl_->take(AppearanceStep::willAppear, false);
    if (parent->impl().state == Appearance::here)
        impl_->take(AppearanceStep::didAppear, false);
}

NavigationController* ViewController::navigationController() const {
    for (ViewController* each = impl_->parent; each; each = each->impl().parent)
        if (auto* const stack = dynamic_cast<NavigationController*>(each))
            return stack;
    return nullptr;
}

void ViewController::presentViewController(const std::shared_ptr<ViewController>& screen,
                                           bool animated, std::function<void()> completion) {
    // A screen that has left meanwhile still has something to say: what it shows is for the user.
    Window* const own = impl_->window();
    Window* const window = own ? own : Application::shared().impl()->visibleWindow();
    if (!window) {
        platformLog(LogLevel::warning, "There is no window to present “%@” in", screen->title());
        return;
    }
    window->impl().presentations.present(screen, animated, std::move(completion));
}

void ViewController::dismissViewController(bool animated, std::function<void()> completion) {
    Window* const window = impl_->window();
    if (window)
        window->impl().presentations.dismissFrom(impl_->topAncestor(), animated,
                                                 std::move(completion));
    else if (completion)
        completion();
}

std::shared_ptr<ViewController> ViewController::presentedViewController() const {
    Window* const window = impl_->window();
    return window ? window->impl().presentations.presentedBy(impl_->topAncestor()) : nullptr;
}

ViewController* ViewController::presentingViewController() const {
    Window* const window = impl_->window();
    return window ? window->impl().presentations.presenterOf(impl_->topAncestor()) : nullptr;
}

PresentationStyle ViewController::modalPresentationStyle() const {
    return impl_->presentationStyle;
}

void ViewController::setModalPresentationStyle(PresentationStyle style) {
    impl_->presentationStyle = style;
}

bool ViewController::extendsUnderBars() const {
    return impl_->underBars;
}

void ViewController::setExtendsUnderBars(bool extends) {
    if (impl_->underBars == extends)
        return;
    impl_->underBars = extends;
    NavigationController* const stack = navigationController();
    if (stack && stack->isViewLoaded())
        stack->view()->setNeedsLayout();
    else if (Window* const window = impl_->window())
        window->impl().place();
}

TraitCollection ViewController::traitCollection() const {
    const Window* const window = impl_->window();
    return window ? window->traitCollection() : TraitCollection{};
}

const std::string& ViewController::restorationIdentifier() const {
    return impl_->restorationIdentifier;
}

void ViewController::setRestorationIdentifier(std::string_view identifier) {
    impl_->restorationIdentifier = identifier;
}

void ViewController::encodeRestorableStateWithCoder(RestorationCoder& /*coder*/) {
}

void ViewController::decodeRestorableStateWithCoder(const RestorationCoder& /*coder*/) {
}

} // namespace platform
