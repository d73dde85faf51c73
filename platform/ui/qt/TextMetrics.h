#pragma once

#include "platform/ui/Font.h"

#include <QFont>
#include <QString>

namespace platform {

/// The line box of a font: the theme's line height with the glyphs centred in it, in whole points.
struct LineMetrics {
    double height;
    double ascent;
    double descent;
};

LineMetrics lineMetrics(const Font& font);

/// The program's typefaces, best first; "Inter", "Noto Sans" or the system's sans serif leads.
const QStringList& fontFamilies();
/// Looks again which of them are installed.
void chooseFontFamilies();

} // namespace platform
