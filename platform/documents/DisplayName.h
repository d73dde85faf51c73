#pragma once

#include <QString>

#include <string>
#include <string_view>

// For .cpp files of this folder only.
namespace platform {

/// A name from a disk as it may be shown: what is not text, and what would change how other text
/// reads (control characters, direction overrides, line ends), stands there as a visible sign.
QString shownName(std::string_view bytes);
std::string displayName(std::string_view bytes);

/// The text so that its reading direction is its own and does not reach what stands beside it.
QString isolated(const QString& text);

} // namespace platform
