#include "platform/ui/qt/ViewImpl.h"

#include "platform/ui/Theme.h"
#include "platform/ui/ViewController.h"
#include "platform/ui/Window.h"
#include "platform/ui/layout/ViewLayout.h"
#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/LiveViews.h"
#include "platform/ui/qt/ViewWidget.h"
#include "platform/ui/qt/WindowImpl.h"

#include <QCoreApplication>

#include <algorithm>
#include <cmath>
#include <utility>

namespace platform {
namespace {

/// Frames come from sums of doubles; a hair above a whole pixel still is that pixel.
constexpr double pixelTolerance = 1e-6;

} // namespace

View::Impl::Impl(std::unique_ptr<QWidget> ownWidget)
    : widget(ownWidget ? ownWidget.release() : new ViewWidget) {
    liveViews().insert(this);
}

View::Impl::~Impl() {
    liveViews().erase(this);
    for (const auto& layer : layers)
        layer->setChangeHandler({});
    if (widget)
        widget->setProperty("platformView", QVariant());
    delete widget.data();
}

void View::Impl::settingsChanged() {
    itemChanged();
    markNeedsLayout();
    if (widget)
        widget->update();
}

QAccessible::Role View::Impl::accessibleRole() const {
    return !tapHandlers.empty() ? QAccessible::Button : QAccessible::Client;
}

QString View::Impl::accessibleText() const {
    return {};
}

void View::Impl::activateTap() {
    keepUntilNextTurn(self->shared_from_this());
    const std::vector<std::function<void()>> handlers = tapHandlers;
    for (const auto& handler : handlers)
        handler();
}

void View::Impl::insert(const std::shared_ptr<View>& child, std::size_t index) {
    View::Impl& added = child->impl();
    added.detachFromSuperview();
    index = std::min(index, subviews.size());
    subviews.insert(subviews.begin() + static_cast<std::ptrdiff_t>(index), child);
    added.superview = self;
    if (widget && added.widget) {
        added.widget->setParent(widget);
        if (index + 1 < subviews.size())
            if (QWidget* const above = subviews[index + 1]->impl().widget)
                added.widget->stackUnder(above);
        added.applyGeometry();
        added.widget->setVisible(!added.hidden);
    }
    added.moveToWindow(window);
    subviewChanged(*child);
}

void View::Impl::detachFromSuperview() {
    if (!superview)
        return;
    View::Impl& parent = superview->impl();
    const auto keep = self->weak_from_this().lock();
    std::erase_if(parent.subviews, [this](const auto& each) { return each.get() == self; });
    View& formerParent = *std::exchange(superview, nullptr);
    if (widget)
        widget->setParent(nullptr);
    moveToWindow(nullptr);
    stackChildLeft(formerParent, *self);
    parent.markNeedsLayout();
}

void View::Impl::moveToWindow(Window* target) {
    if (window == target)
        return;
    if (window)
        window->impl().engine.removeItem(*this);
    window = target;
    if (window) {
        window->impl().engine.addItem(*this);
        markNeedsLayout();
    }
    const std::vector<std::shared_ptr<View>> children = subviews;
    for (const auto& child : children)
        child->impl().moveToWindow(target);
    self->didMoveToWindow();
}

void View::Impl::settingsChangedInTree() {
    settingsChanged();
    const std::vector<std::shared_ptr<View>> children = subviews;
    for (const auto& child : children)
        child->impl().settingsChangedInTree();
}

void View::Impl::applyGeometry() {
    if (!widget)
        return;
    const Point base = superview ? superview->impl().contentOffset : Point{};
    const double x = frame.x + translation.x + base.x;
    const double y = frame.y + translation.y + base.y;
    const double left = std::floor(x + pixelTolerance);
    const double top = std::floor(y + pixelTolerance);
    const double right = std::ceil(x + frame.width - pixelTolerance);
    const double bottom = std::ceil(y + frame.height - pixelTolerance);
    const Point offset{std::max(0.0, x - left), std::max(0.0, y - top)};
    const bool shifted = !(offset == contentOffset);
    contentOffset = offset;
    widget->setGeometry(static_cast<int>(left), static_cast<int>(top),
                        static_cast<int>(std::max(0.0, right - left)),
                        static_cast<int>(std::max(0.0, bottom - top)));
    if (!shifted)
        return;
    widget->update();
    for (const auto& child : subviews)
        child->impl().applyGeometry();
}

void View::Impl::setFrameNow(Rect value) {
    if (frame == value)
        return;
    const bool resized = frame.width != value.width || frame.height != value.height;
    frame = value;
    applyGeometry();
    if (!byConstraints)
        itemChanged();
    if (resized)
        markNeedsLayout();
}

void View::Impl::setTranslation(Point value) {
    translation = value;
    applyGeometry();
}

void View::Impl::setScale(double value) {
    scale = value;
    applyEffect();
}

void View::Impl::markNeedsLayout() {
    needsLayout = true;
    for (View* each = self; each && !each->impl().treeNeedsLayout; each = each->impl().superview)
        each->impl().treeNeedsLayout = true;
    if (window)
        window->impl().scheduleLayout();
}

void View::Impl::itemChanged() {
    if (!window)
        return;
    window->impl().engine.itemChanged(*this);
    window->impl().scheduleLayout();
}

LayoutItem& layoutItemOf(View& view) {
    return view.impl();
}

void View::Impl::subviewChanged(View& child) {
    self->subviewDidChange(child);
    markNeedsLayout();
}

void View::Impl::runLayoutSubviews() {
    if (!treeNeedsLayout)
        return;
    treeNeedsLayout = false;
    if (std::exchange(needsLayout, false)) {
        self->layoutSubviews();
        if (controller)
            controller->viewDidLayoutSubviews();
    }
    const std::vector<std::shared_ptr<View>> children = subviews;
    for (const auto& child : children)
        child->impl().runLayoutSubviews();
}

void View::Impl::updateAccessibleName() {
    if (widget)
        widget->setAccessibleName(accessibleName.empty() ? accessibleText() : toQt(accessibleName));
}

LayoutItem* View::Impl::layoutParent() const {
    return superview ? &superview->impl() : nullptr;
}

Size View::Impl::layoutIntrinsicSize() const {
    return self->intrinsicContentSize();
}

double View::Impl::layoutHeightForWidth(double width) const {
    return self->intrinsicHeightForWidth(width);
}

LayoutPriority View::Impl::layoutHugging(Axis axis) const {
    return hugging[static_cast<int>(axis)];
}

LayoutPriority View::Impl::layoutCompressionResistance(Axis axis) const {
    return resistance[static_cast<int>(axis)];
}

void View::Impl::setSolvedFrame(Rect solved) {
    // A frame set by hand is exact already; the solver's rounding must not move a page that slides.
    if (!byConstraints || frame == solved)
        return;
    setFrameNow(solved);
    if (superview)
        superview->impl().markNeedsLayout();
}

std::string View::Impl::layoutName() const {
    return debugName.empty() ? "View" : debugName;
}

void keepUntilNextTurn(std::shared_ptr<void> object) {
    if (QCoreApplication* const application = QCoreApplication::instance())
        QMetaObject::invokeMethod(
            application, [object] {}, Qt::QueuedConnection);
}

View* ownerOf(const QWidget* widget) {
    View* const view = viewOf(widget);
    return view && view->impl().widget == widget ? view : nullptr;
}

bool canTakeFocus(const QWidget& widget) {
    return widget.isVisible() && widget.isEnabled() && (widget.focusPolicy() & Qt::TabFocus) != 0;
}

} // namespace platform
