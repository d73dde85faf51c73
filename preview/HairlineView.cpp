#include "preview/HairlineView.h"

#include "platform/ui/Application.h"
#include "platform/ui/Theme.h"
#include "platform/ui/Window.h"

namespace tavrin {

using platform::LayoutAttribute;
using platform::LayoutConstraint;

HairlineView::HairlineView() {
    setLaidOutByConstraints(true);
    setBackgroundColor(platform::Theme::hairline);
    setCompressionResistancePriority(platform::layoutRequired, platform::Axis::vertical);
    LayoutConstraint::constant(*this, LayoutAttribute::height, platform::LayoutRelation::equal,
                               _hairline())
        ->setActive(true);
}

double HairlineView::_hairline() const {
    const platform::Window* shown = window();
    return 1 / (shown ? shown->screenScale() : platform::Application::shared().mainScreenScale());
}

} // namespace tavrin
