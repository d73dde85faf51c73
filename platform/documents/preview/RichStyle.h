#pragma once

#include "platform/ui/Font.h"

#include <QString>

namespace platform {

/// Of letters that are that many times as large as usual; in pixels.
int richLetterSize(TextStyle style, double scale);
/// How a text with structure looks: quiet and roomy, with sizes in pixels of the letters' own
/// scale.
QString richStyleSheet(double scale);

} // namespace platform
