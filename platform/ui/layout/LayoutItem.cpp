#include "platform/ui/layout/LayoutItem.h"

#include "platform/ui/layout/LayoutEngine.h"
#include "platform/ui/layout/LayoutLink.h"

namespace platform {

LayoutItem::LayoutItem() : link_(std::make_shared<LayoutLink>()) {
    link_->item = this;
}

LayoutItem::~LayoutItem() {
    if (link_->engine)
        link_->engine->removeItem(*this);
    // Each deactivation shortens the list.
    while (!link_->active.empty()) {
        const LayoutConstraint::Pointer constraint = link_->active.back();
        constraint->setActive(false);
    }
    link_->item = nullptr;
}

LayoutEngine* LayoutItem::layoutEngine() const {
    return link_->engine;
}

} // namespace platform
