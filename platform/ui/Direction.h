#pragma once

#include "platform/ui/Geometry.h"

namespace platform {

/// The rectangle as it stands in the program's reading direction: `rect` is measured from the
/// leading edge of a container of that width.
Rect mirrored(Rect rect, double containerWidth);

/// Between the edge of a page and what stands on it: wider on a tablet.
double pageMargin();

/// 1 where reading goes to the right, -1 where it goes to the left.
double readingSign();

} // namespace platform
