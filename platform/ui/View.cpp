#include "platform/ui/View.h"

#include "platform/ui/Window.h"
#include "platform/ui/layout/ViewLayout.h"
#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/ViewImpl.h"

#include <algorithm>

namespace platform {

View::View(Rect frame) : View(std::make_unique<Impl>()) {
    impl_->hand = frame;
    impl_->setFrameNow(frame);
}

View::View(std::unique_ptr<Impl> impl) : impl_(std::move(impl)) {
    impl_->self = this;
    if (impl_->widget)
        impl_->widget->setProperty("platformView", QVariant::fromValue(static_cast<void*>(this)));
}

View::~View() {
    // A child that others hold lives on, with its widget.
    const std::vector<std::shared_ptr<View>> children = std::move(impl_->subviews);
    impl_->subviews.clear();
    for (const auto& child : children) {
        child->impl().superview = nullptr;
        if (child->impl().widget)
            child->impl().widget->setParent(nullptr);
        child->impl().moveToWindow(nullptr);
    }
}

void View::addSubview(const std::shared_ptr<View>& child) {
    impl_->insert(child, impl_->subviews.size());
}

void View::insertSubview(const std::shared_ptr<View>& child, std::size_t index) {
    impl_->insert(child, index);
}

void View::removeFromSuperview() {
    impl_->detachFromSuperview();
}

View* View::superview() const {
    return impl_->superview;
}

const std::vector<std::shared_ptr<View>>& View::subviews() const {
    return impl_->subviews;
}

Window* View::window() const {
    return impl_->window;
}

Rect View::frame() const {
    return impl_->frame;
}

void View::setFrame(Rect frame) {
    impl_->hand = frame;
    // The solver's answer stands; a frame set by hand would only flicker.
    if (!impl_->byConstraints || !impl_->window)
        impl_->setFrameNow(frame);
}

Rect View::bounds() const {
    return {0, 0, impl_->frame.width, impl_->frame.height};
}

Rect View::convertToWindow(Rect rect) const {
    const QWidget* const widget = impl_->widget;
    if (!impl_->window || !widget)
        return rect;
    const QPoint origin = widget->mapTo(widget->window(), QPoint(0, 0));
    rect.x += origin.x() + impl_->contentOffset.x;
    rect.y += origin.y() + impl_->contentOffset.y;
    return rect;
}

bool View::isHidden() const {
    return impl_->hidden;
}

void View::setHidden(bool hidden) {
    if (impl_->hidden == hidden)
        return;
    impl_->hidden = hidden;
    if (impl_->widget && impl_->superview)
        impl_->widget->setVisible(!hidden);
    if (!impl_->superview)
        return;
    stackChildChangedHidden(*this);
    impl_->superview->impl().subviewChanged(*this);
}

double View::alpha() const {
    return impl_->alpha;
}

void View::setAlpha(double alpha) {
    impl_->alpha = std::clamp(alpha, 0.0, 1.0);
    impl_->applyEffect();
}

std::optional<Color> View::backgroundColor() const {
    return impl_->background;
}

void View::setBackgroundColor(std::optional<Color> color) {
    impl_->background = color;
    setNeedsDisplay();
}

void View::setCornerRadius(double radius) {
    impl_->cornerRadius = radius;
    setNeedsDisplay();
}

bool View::isUserInteractionEnabled() const {
    return !impl_->widget || !impl_->widget->testAttribute(Qt::WA_TransparentForMouseEvents);
}

void View::setUserInteractionEnabled(bool enabled) {
    if (impl_->widget)
        impl_->widget->setAttribute(Qt::WA_TransparentForMouseEvents, !enabled);
}

void View::addTapHandler(std::function<void()> handler) {
    impl_->tapHandlers.push_back(std::move(handler));
    if (!impl_->widget)
        return;
    impl_->widget->setFocusPolicy(Qt::TabFocus);
    impl_->widget->setCursor(Qt::PointingHandCursor);
}

void View::addLayer(const std::shared_ptr<ShapeLayer>& layer) {
    impl_->layers.push_back(layer);
    layer->setChangeHandler([this] { setNeedsDisplay(); });
    setNeedsDisplay();
}

void View::setLayerShadow(const LayerShadow& shadow) {
    impl_->shadow = shadow;
    setNeedsDisplay();
}

void View::setAccessibleName(std::string_view name) {
    impl_->accessibleName = name;
    impl_->updateAccessibleName();
}

void View::setDebugName(std::string_view name) {
    impl_->debugName = name;
    if (impl_->widget)
        impl_->widget->setObjectName(toQt(name));
}

std::string View::debugName() const {
    return impl_->debugName;
}

bool View::isLaidOutByConstraints() const {
    return impl_->byConstraints;
}

void View::setLaidOutByConstraints(bool value) {
    if (impl_->byConstraints == value)
        return;
    impl_->byConstraints = value;
    if (!value)
        impl_->hand = impl_->frame;
    impl_->itemChanged();
}

LayoutPriority View::contentHuggingPriority(Axis axis) const {
    return impl_->layoutHugging(axis);
}

void View::setContentHuggingPriority(LayoutPriority priority, Axis axis) {
    impl_->hugging[static_cast<int>(axis)] = priority;
    impl_->itemChanged();
}

LayoutPriority View::compressionResistancePriority(Axis axis) const {
    return impl_->layoutCompressionResistance(axis);
}

void View::setCompressionResistancePriority(LayoutPriority priority, Axis axis) {
    impl_->resistance[static_cast<int>(axis)] = priority;
    impl_->itemChanged();
}

Size View::intrinsicContentSize() const {
    return {noIntrinsicMetric, noIntrinsicMetric};
}

double View::intrinsicHeightForWidth(double /*width*/) const {
    return noIntrinsicMetric;
}

void View::invalidateIntrinsicContentSize() {
    impl_->itemChanged();
    if (impl_->superview)
        impl_->superview->impl().subviewChanged(*this);
}

void View::setNeedsLayout() {
    impl_->markNeedsLayout();
}

void View::layoutIfNeeded() {
    if (impl_->window)
        impl_->window->layoutIfNeeded();
}

void View::sizeToFit() {
    const Size natural = intrinsicContentSize();
    Rect frame = impl_->frame;
    if (natural.width != noIntrinsicMetric)
        frame.width = natural.width;
    const double wrapped = intrinsicHeightForWidth(frame.width);
    if (wrapped != noIntrinsicMetric)
        frame.height = wrapped;
    else if (natural.height != noIntrinsicMetric)
        frame.height = natural.height;
    setFrame(frame);
}

void View::setNeedsDisplay() {
    if (impl_->widget)
        impl_->widget->update();
}

void View::draw(Canvas& /*canvas*/) {
}

void View::layoutSubviews() {
}

void View::didMoveToWindow() {
}

void View::subviewDidChange(View& /*child*/) {
}

} // namespace platform
