#include "platform/ui/VisualFormat.h"

#include "platform/ui/layout/ViewLayout.h"
#include "platform/ui/layout/VisualFormatParser.h"

namespace platform {

Result<std::vector<LayoutConstraint::Pointer>>
constraintsWithVisualFormat(std::string_view format, const NamedViews& views) {
    return constraintsForFormat(format, [&](std::string_view name) -> LayoutItem* {
        const auto found = views.find(name);
        return found == views.end() || !found->second ? nullptr : &layoutItemOf(*found->second);
    });
}

} // namespace platform
