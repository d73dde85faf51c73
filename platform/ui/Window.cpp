#include "platform/ui/Window.h"

#include "platform/ui/Application.h"
#include "platform/ui/Theme.h"
#include "platform/ui/ViewControllerImpl.h"
#include "platform/ui/qt/ApplicationImpl.h"
#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/ViewImpl.h"
#include "platform/ui/qt/WindowImpl.h"

#include <QBuffer>

namespace platform {

Window::Window(Rect frame) : impl_(std::make_unique<Impl>(*this, frame)) {
    Application::shared().impl()->windows.push_back(this);
    impl_->rootView->impl().moveToWindow(this);
    impl_->sizeChanged();
}

Window::~Window() {
    if (Application::Impl* const application = applicationImpl())
        std::erase(application->windows, this);
    impl_->presentations.dismissAll();
    setRootViewController(nullptr);
    impl_->rootView->impl().moveToWindow(nullptr);
}

void Window::setRootViewController(std::shared_ptr<ViewController> root) {
    if (impl_->root == root)
        return;
    impl_->presentations.dismissAll();
    if (const auto former = std::exchange(impl_->root, nullptr)) {
        former->impl().take(AppearanceStep::willDisappear, false);
        if (former->isViewLoaded())
            former->view()->removeFromSuperview();
        former->impl().take(AppearanceStep::didDisappear, false);
    }
    impl_->root = std::move(root);
    if (!impl_->root)
        return;
    const auto view = impl_->root->view();
    view->setLaidOutByConstraints(false);
    impl_->rootView->insertSubview(view, 0);
    impl_->place();
    if (!impl_->visible)
        return;
    impl_->root->impl().take(AppearanceStep::willAppear, false);
    layoutIfNeeded();
    impl_->root->impl().take(AppearanceStep::didAppear, false);
}

std::shared_ptr<ViewController> Window::rootViewController() const {
    return impl_->root;
}

void Window::setBackgroundColor(Color color) {
    impl_->rootView->setBackgroundColor(color);
}

void Window::makeKeyAndVisible() {
    impl_->show();
}

bool Window::isVisible() const {
    return impl_->visible;
}

void Window::close() {
    if (impl_->widget)
        impl_->widget->close();
}

Size Window::size() const {
    return impl_->size;
}

void Window::resize(Size size) {
    impl_->resize(size);
}

TraitCollection Window::traitCollection() const {
    return traitsForSize(impl_->size.width, impl_->size.height);
}

Orientation Window::orientation() const {
    return orientationForSize(impl_->size.width, impl_->size.height);
}

double Window::screenScale() const {
    return impl_->widget ? impl_->widget->devicePixelRatioF() : 1;
}

Rect Window::statusBarFrame() const {
    return {0, 0, impl_->size.width, StatusStrip::height()};
}

void Window::setStatusStrip(const StatusStripContent& content) {
    if (!(impl_->strip->content() == content))
        impl_->strip->setContent(content);
}

const StatusStripContent& Window::statusStrip() const {
    return impl_->strip->content();
}

void Window::setStatusStripHandler(std::function<void()> tapped) {
    impl_->strip->setTapped(std::move(tapped));
}

bool Window::layoutIfNeeded() {
    return impl_->layout();
}

Bytes Window::snapshotPng(double scale) const {
    impl_->layout();
    QByteArray encoded;
    QBuffer buffer(&encoded);
    buffer.open(QIODevice::WriteOnly);
    impl_->picture(scale).save(&buffer, "PNG");
    const auto* const first = reinterpret_cast<const std::byte*>(encoded.constData());
    return {first, first + encoded.size()};
}

} // namespace platform
