#pragma once

#include "platform/base/Result.h"
#include "platform/ui/layout/LayoutItem.h"

#include <functional>
#include <string>
#include <string_view>
#include <vector>

namespace platform {

/// A visual format as it was read, before its names are looked up.
struct ParsedFormat {
    /// ">=8@250" or "==other".
    struct Predicate {
        LayoutRelation relation = LayoutRelation::equal;
        double number = 0;
        /// The other view, for a size as large as its; else the number counts.
        std::string view;
        LayoutPriority priority = layoutRequired;
        std::size_t place = 0;
    };
    struct View {
        std::string name;
        std::size_t place = 0;
        std::vector<Predicate> sizes;
    };
    using Gap = std::vector<Predicate>;

    Axis axis = Axis::horizontal;
    bool startsAtSuperview = false;
    bool endsAtSuperview = false;
    std::vector<View> views;
    /// Between the views, and before the first and after the last where the superview stands there.
    std::vector<Gap> gaps;
};

/// The space that a bare "-" stands for, in points.
inline constexpr double standardSpace = 8;

Result<ParsedFormat> parseVisualFormat(std::string_view format);

/// Names the place, counted from 0, and what is wrong there.
Error visualFormatError(std::string_view format, std::size_t place, std::string_view what);

using ItemByName = std::function<LayoutItem*(std::string_view name)>;

/// The constraints of a format between items; none of them is active. `itemNamed` answers none for
/// an unknown name.
Result<std::vector<LayoutConstraint::Pointer>> constraintsForFormat(std::string_view format,
                                                                    const ItemByName& itemNamed);

} // namespace platform
