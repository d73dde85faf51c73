#pragma once

#include "platform/base/Url.h"

#include <cstdint>
#include <optional>
#include <string>

namespace platform {

/// What the launch service knows of an installed application (a desktop entry).
struct ApplicationRecord {
    std::optional<std::string> itemName;
    std::optional<std::string> localizedName;
    std::optional<std::string> localizedShortName;
    std::optional<std::string> shortVersionString;
    std::optional<std::string> vendorName;
    /// The desktop entry's name without ".desktop".
    std::string bundleIdentifier;
    /// The program that the entry runs.
    std::optional<std::string> bundleExecutable;
    /// The folder in which the entry lies.
    std::optional<Url> bundleContainerURL;
    bool isInstalled = true;
    std::uint64_t itemID = 0;
    /// The entry takes a local path (%f, %F) or a file URL (%u, %U), so it works on the document
    /// where it lies instead of on a copy.
    bool supportsOpenInPlace = false;
};

void appendDescription(std::string& out, const ApplicationRecord& record);

} // namespace platform
