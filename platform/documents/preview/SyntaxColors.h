#pragma once

#include "platform/documents/preview/SyntaxScanner.h"
#include "platform/ui/Color.h"

namespace platform {

/// On a light ground or on a dark one; 4.5 : 1 against it at least.
Color syntaxColor(SyntaxKind kind, const Color& ground);

} // namespace platform
