#pragma once

#include "platform/documents/list/RowStyle.h"
#include "platform/ui/Geometry.h"

namespace platform {

/// What a row has on it, as far as its layout cares.
struct RowParts {
    double width = 0;
    double height = 0;
    double iconEdge = 0;
    bool badge = false;
    bool chevron = false;
    bool more = false;
    /// 0 outside edit mode, 1 in it; between the two while it comes and goes.
    double editing = 0;
};

/// Where the parts of a row are, in the row's own coordinates and reading from the left; paint and
/// hit tests mirror what they take from here.
struct RowGeometry {
    RowGeometry(const RowParts& parts, const RowStyle& style);

    Rect circle;
    Rect icon;
    Rect name;
    Rect details;
    Rect badge;
    Rect chevron;
    /// The whole target, larger than what is drawn in it.
    Rect more;
    /// Where the line below the row begins.
    double lineStart = 0;
};

} // namespace platform
