#pragma once

#include "platform/ui/View.h"

#include <vector>

namespace tavrin {

/// Layouts that several screens use. The constraints are answered, not activated. No state.
class ConstraintUtils {
public:
    ConstraintUtils() = delete;
    using Constraints = std::vector<platform::LayoutConstraint::Pointer>;

    /// Two children centred below each other in a parent that is as high as both and the gap.
    static Constraints verticallyStackedConstraintsInParent(platform::View& parent,
                                                            platform::View& topChild,
                                                            platform::View& bottomChild,
                                                            double middleGap);
    /// The subview fills the container: tops, bottoms, centres and leading edges meet.
    static Constraints stretchSubviewConstraints(platform::View& subview,
                                                 platform::View& withinView);
};

} // namespace tavrin
