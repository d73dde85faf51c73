#include "platform/ui/LayoutConstraint.h"
#include "platform/ui/layout/ConstraintImpl.h"
#include "platform/ui/layout/ViewLayout.h"

namespace platform {

LayoutConstraint::Pointer LayoutConstraint::make(View& first, LayoutAttribute attribute,
                                                 LayoutRelation relation, View* second,
                                                 LayoutAttribute secondAttribute, double multiplier,
                                                 double constant) {
    return Impl::make(layoutItemOf(first), attribute, relation,
                      second ? &layoutItemOf(*second) : nullptr, secondAttribute, multiplier,
                      constant);
}

LayoutConstraint::Pointer LayoutConstraint::equal(View& first, LayoutAttribute attribute,
                                                  View& second, LayoutAttribute secondAttribute,
                                                  double constant) {
    return Impl::equal(layoutItemOf(first), attribute, layoutItemOf(second), secondAttribute,
                       constant);
}

LayoutConstraint::Pointer LayoutConstraint::constant(View& first, LayoutAttribute attribute,
                                                     LayoutRelation relation, double constant) {
    return Impl::make(layoutItemOf(first), attribute, relation, nullptr, LayoutAttribute::none, 1,
                      constant);
}

} // namespace platform
