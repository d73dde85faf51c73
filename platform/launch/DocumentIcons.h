#pragma once

#include "platform/ui/Image.h"

#include <string_view>

namespace platform {

/// Icons of types and folders, from the user's icon theme, else Breeze, else drawn by ourselves: a
/// page with a coloured band and the extension. Square, at the screen's pixel size for an edge of
/// `points`. Main thread only; cached.
class DocumentIcons {
public:
    static Image forType(std::string_view typeIdentifier, double points);
    static Image folder(double points);
    /// An application library's icon: a rounded square with the first letter of its name, in a
    /// colour that belongs to the container's identifier.
    static Image container(std::string_view identifier, std::string_view localizedName,
                           double points);
};

} // namespace platform
