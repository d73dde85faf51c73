#include "preview/ConstraintUtils.h"

namespace tavrin {

using platform::LayoutAttribute;
using platform::LayoutConstraint;
using platform::LayoutRelation;
using platform::View;

ConstraintUtils::Constraints
ConstraintUtils::verticallyStackedConstraintsInParent(View& parent, View& topChild,
                                                      View& bottomChild, double middleGap) {
    const auto notWider = [&parent](View& child) {
        return LayoutConstraint::make(child, LayoutAttribute::width, LayoutRelation::lessOrEqual,
                                      &parent, LayoutAttribute::width);
    };
    const auto centred = [&parent](View& child) {
        return LayoutConstraint::equal(child, LayoutAttribute::centerX, parent,
                                       LayoutAttribute::centerX);
    };
    return {centred(topChild),
            notWider(topChild),
            centred(bottomChild),
            notWider(bottomChild),
            LayoutConstraint::equal(parent, LayoutAttribute::top, topChild, LayoutAttribute::top),
            LayoutConstraint::equal(bottomChild, LayoutAttribute::top, topChild,
                                    LayoutAttribute::bottom, middleGap),
            LayoutConstraint::equal(bottomChild, LayoutAttribute::bottom, parent,
                                    LayoutAttribute::bottom)};
}

ConstraintUtils::Constraints ConstraintUtils::stretchSubviewConstraints(View& subview,
                                                                        View& withinView) {
    const auto same = [&](LayoutAttribute attribute) {
        return LayoutConstraint::equal(subview, attribute, withinView, attribute);
    };
    return {same(LayoutAttribute::top), same(LayoutAttribute::bottom),
            same(LayoutAttribute::centerX), same(LayoutAttribute::leading)};
}

} // namespace tavrin
