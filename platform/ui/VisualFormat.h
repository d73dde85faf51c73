#pragma once

#include "platform/base/Result.h"
#include "platform/ui/LayoutConstraint.h"

#include <map>
#include <string>
#include <string_view>
#include <vector>

namespace platform {

using NamedViews = std::map<std::string, View*, std::less<>>;

/// Constraints from a line such as "H:|[name]-10-[value]|", "V:|-(>=8)-[a(==b)]" or "[a(==b)]":
/// an optional axis (horizontal when absent), "|" for the superview, "-" for the standard space of
/// 8 points, numbers, relations (==, >=, <=) and "@priority" in brackets. Not activated. An error
/// names the place in the text that could not be read, or the view that is unknown.
Result<std::vector<LayoutConstraint::Pointer>> constraintsWithVisualFormat(std::string_view format,
                                                                           const NamedViews& views);

} // namespace platform
