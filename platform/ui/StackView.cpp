#include "platform/ui/StackView.h"

#include "platform/ui/layout/StackConstraints.h"
#include "platform/ui/layout/ViewLayout.h"

#include <algorithm>

namespace platform {

struct StackView::Arrangement {
    std::vector<std::shared_ptr<View>> views;
    StackRules rules;
    StackConstraints constraints;
};

StackView::StackView(Rect frame) : View(frame), arrangement_(std::make_unique<Arrangement>()) {
}

StackView::StackView(const std::vector<std::shared_ptr<View>>& arranged) : StackView() {
    for (const auto& view : arranged)
        addArrangedSubview(view);
}

StackView::~StackView() = default;

const std::vector<std::shared_ptr<View>>& StackView::arrangedSubviews() const {
    return arrangement_->views;
}

void StackView::addArrangedSubview(const std::shared_ptr<View>& view) {
    std::erase(arrangement_->views, view);
    if (view->superview() != this)
        addSubview(view);
    view->setLaidOutByConstraints(true);
    arrangement_->views.push_back(view);
    arrange();
}

void StackView::removeArrangedSubview(const std::shared_ptr<View>& view) {
    // The caller may have lent the list's own pointer.
    const std::shared_ptr<View> removed = view;
    if (std::erase(arrangement_->views, removed) == 0)
        return;
    arrange();
    removed->removeFromSuperview();
}

Axis StackView::axis() const {
    return arrangement_->rules.axis;
}

void StackView::setAxis(Axis axis) {
    arrangement_->rules.axis = axis;
    arrange();
}

StackDistribution StackView::distribution() const {
    return arrangement_->rules.distribution;
}

void StackView::setDistribution(StackDistribution distribution) {
    arrangement_->rules.distribution = distribution;
    arrange();
}

StackAlignment StackView::alignment() const {
    return arrangement_->rules.alignment;
}

void StackView::setAlignment(StackAlignment alignment) {
    arrangement_->rules.alignment = alignment;
    arrange();
}

double StackView::spacing() const {
    return arrangement_->rules.spacing;
}

void StackView::setSpacing(double spacing) {
    arrangement_->rules.spacing = spacing;
    arrange();
}

void StackView::arrange() {
    std::vector<LayoutItem*> shown;
    for (const auto& view : arrangement_->views)
        if (!view->isHidden())
            shown.push_back(&layoutItemOf(*view));
    arrangement_->constraints.arrange(layoutItemOf(*this), shown, arrangement_->rules);
}

void stackChildChangedHidden(View& child) {
    if (auto* const stack = dynamic_cast<StackView*>(child.superview()))
        stack->arrange();
}

void stackChildLeft(View& formerParent, View& child) {
    auto* const stack = dynamic_cast<StackView*>(&formerParent);
    if (stack && std::erase_if(stack->arrangement_->views,
                               [&](const auto& view) { return view.get() == &child; }) > 0)
        stack->arrange();
}

} // namespace platform
