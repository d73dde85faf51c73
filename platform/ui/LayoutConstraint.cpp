#include "platform/ui/LayoutConstraint.h"

#include "platform/base/Format.h"
#include "platform/ui/layout/ConstraintImpl.h"
#include "platform/ui/layout/LayoutEngine.h"

#include <algorithm>
#include <array>
#include <cmath>

namespace platform {

namespace {

std::uint64_t activations = 0;

std::string_view attributeName(LayoutAttribute attribute) {
    static constexpr std::array<std::string_view, 11> names = {
        "none",     "left",  "right",  "top",     "bottom", "leading",
        "trailing", "width", "height", "centerX", "centerY"};
    return names[static_cast<std::size_t>(attribute)];
}

void dropFrom(LayoutLink* link, const LayoutConstraint* constraint) {
    if (!link)
        return;
    // From the back: what was activated last usually goes first.
    auto& list = link->active;
    for (std::size_t i = list.size(); i-- > 0;)
        if (list[i].get() == constraint) {
            std::swap(list[i], list.back());
            list.pop_back();
            return;
        }
}

void appendEnd(std::string& out, const LayoutConstraint::Impl::End& end) {
    const LayoutItem* item = end.item();
    out += item ? item->layoutName() : std::string("(gone)");
    out += '.';
    out += attributeName(end.attribute);
}

} // namespace

LayoutConstraint::LayoutConstraint(std::unique_ptr<Impl> impl) : impl_(std::move(impl)) {
}
LayoutConstraint::~LayoutConstraint() = default;

LayoutConstraint::Pointer LayoutConstraint::Impl::make(LayoutItem& first, LayoutAttribute attribute,
                                                       LayoutRelation relation, LayoutItem* second,
                                                       LayoutAttribute secondAttribute,
                                                       double multiplier, double constant) {
    auto impl = std::make_unique<Impl>();
    impl->first = {first.layoutLink(), attribute};
    if (second)
        impl->second = {second->layoutLink(), secondAttribute};
    impl->relation = relation;
    impl->multiplier = multiplier;
    impl->constant = constant;
    return Pointer(new LayoutConstraint(std::move(impl)));
}

LayoutConstraint::Pointer
LayoutConstraint::Impl::equal(LayoutItem& first, LayoutAttribute attribute, LayoutItem& second,
                              LayoutAttribute secondAttribute, double constant) {
    return make(first, attribute, LayoutRelation::equal, &second, secondAttribute, 1, constant);
}

LayoutEngine* LayoutConstraint::Impl::engine() const {
    LayoutEngine* const engine = first.link->engine;
    return !second.link || second.link->engine == engine ? engine : nullptr;
}

layout::Strength LayoutConstraint::Impl::strength() const {
    return {relation == LayoutRelation::lessOrEqual ? 0 : priority,
            relation == LayoutRelation::greaterOrEqual ? 0 : priority};
}

void LayoutConstraint::Impl::setActive(LayoutConstraint& self, bool value) {
    if (active == value)
        return;
    if (value) {
        // A constraint on a dead view can never speak again.
        if (!first.item() || (second.link && !second.item()))
            return;
        active = true;
        activation = ++activations;
        const Pointer pointer = self.shared_from_this();
        first.link->active.push_back(pointer);
        if (second.link && second.link != first.link)
            second.link->active.push_back(pointer);
        if (LayoutEngine* const home = engine())
            home->addConstraint(pointer);
        return;
    }
    active = false;
    if (LayoutEngine* const home = engine())
        home->removeConstraint(self);
    dropFrom(first.link.get(), &self);
    if (second.link != first.link)
        dropFrom(second.link.get(), &self);
}

void LayoutConstraint::activate(const std::vector<Pointer>& constraints) {
    for (const Pointer& constraint : constraints)
        constraint->setActive(true);
}

void LayoutConstraint::deactivate(const std::vector<Pointer>& constraints) {
    for (const Pointer& constraint : constraints)
        constraint->setActive(false);
}

bool LayoutConstraint::isActive() const {
    return impl_->active;
}

void LayoutConstraint::setActive(bool active) {
    // Deactivation may drop the last pointer to this constraint.
    const Pointer guard = shared_from_this();
    impl_->setActive(*this, active);
}

double LayoutConstraint::constant() const {
    return impl_->constant;
}

void LayoutConstraint::setConstant(double constant) {
    if (impl_->constant == constant)
        return;
    impl_->constant = constant;
    if (LayoutEngine* const engine = impl_->active ? impl_->engine() : nullptr)
        engine->constraintChanged(*this);
}

LayoutPriority LayoutConstraint::priority() const {
    return impl_->priority;
}

void LayoutConstraint::setPriority(LayoutPriority priority) {
    // A value out of range, or no number at all, becomes the nearest priority there is.
    const LayoutPriority valid = priority >= 1 ? std::min(priority, layoutRequired) : 1;
    if (impl_->priority == valid)
        return;
    impl_->priority = valid;
    if (LayoutEngine* const engine = impl_->active ? impl_->engine() : nullptr)
        engine->constraintChanged(*this);
}

View* LayoutConstraint::firstView() const {
    LayoutItem* const item = impl_->first.item();
    return item ? item->layoutView() : nullptr;
}

LayoutAttribute LayoutConstraint::firstAttribute() const {
    return impl_->first.attribute;
}

LayoutRelation LayoutConstraint::relation() const {
    return impl_->relation;
}

View* LayoutConstraint::secondView() const {
    LayoutItem* const item = impl_->second.item();
    return item ? item->layoutView() : nullptr;
}

LayoutAttribute LayoutConstraint::secondAttribute() const {
    return impl_->second.attribute;
}

double LayoutConstraint::multiplier() const {
    return impl_->multiplier;
}

void appendDescription(std::string& out, const LayoutConstraint& constraint) {
    const LayoutConstraint::Impl& impl = constraint.impl();
    appendEnd(out, impl.first);
    out += impl.relation == LayoutRelation::equal         ? " == "
           : impl.relation == LayoutRelation::lessOrEqual ? " <= "
                                                          : " >= ";
    if (!impl.second.link) {
        describe(out, impl.constant);
    } else {
        appendEnd(out, impl.second);
        if (impl.multiplier != 1)
            out += format(" * %@", impl.multiplier);
        if (impl.constant != 0) {
            out += impl.constant < 0 ? " - " : " + ";
            describe(out, std::abs(impl.constant));
        }
    }
    if (impl.priority < layoutRequired)
        out += format(" @%@", static_cast<double>(impl.priority));
}

} // namespace platform
