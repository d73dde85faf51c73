#pragma once

#include "platform/ui/Font.h"

#include <QFont>

namespace platform {

/// Fonts and measures of rows, at the user's text scale and on this device.
struct RowStyle {
    /// By the settings of this moment.
    static RowStyle current();
    /// The settings are still those that it was made by.
    bool isCurrent() const;

    QFont name;
    QFont details;
    double nameHeight = 0;
    double nameAscent = 0;
    double detailsHeight = 0;
    double detailsAscent = 0;
    double rowHeight = 0;
    double containerHeight = 0;
    double margin = 0;
    /// "More" is always there where there is no pointer that could hover.
    bool alwaysShowsMore = false;
    bool rightToLeft = false;
    double textScale = 1;
};

} // namespace platform
