#pragma once

#include "platform/ui/Image.h"

#include <string_view>

namespace platform {

/// Icons of types and folders, from the user's icon theme, else Breeze, else drawn by ourselves.
/// Main thread only; cached.
class DocumentIcons {
public:
    /// Drawn at the screen's pixel size for an edge of `points`.
    static Image forType(std::string_view typeIdentifier, double points);
    static Image folder(double points);
    /// An application library's icon; `identifier` is the container's.
    static Image container(std::string_view identifier, double points);
};

} // namespace platform
