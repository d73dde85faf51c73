#pragma once

#include "platform/documents/preview/HtmlElements.h"
#include "platform/documents/preview/HtmlScanner.h"

namespace platform {

/// Longer values are cut.
inline constexpr qsizetype longestHtmlValue = 4096;

/// What is kept of the attributes of an element, as it is written behind its name: where it leads
/// to, what it is called, and how its text stands.
QString keptAttributes(const HtmlElement& element, const HtmlMarkup& markup);

} // namespace platform
