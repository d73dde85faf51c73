#pragma once

#include "platform/ui/Color.h"
#include "platform/ui/Geometry.h"
#include "platform/ui/Image.h"

#include <array>
#include <map>
#include <optional>
#include <string>
#include <vector>

namespace tavrin {

/// Which colour goes with which tag name, as the user's synced key-value store has it, and the dots
/// that stand for tags. The tables are read on first use and again whenever that store changes
/// elsewhere. Reads are safe from any thread; drawing belongs to the main thread.
class FileTags {
public:
    FileTags() = delete;
    using ColorMap = std::map<std::string, platform::Color>;

    static ColorMap tagColorsByTag();
    /// In the user's order; a repeated name is there twice.
    static std::vector<std::string> allTags();
    /// By colour label.
    static const std::array<platform::Color, 8>& _tagBlipColors();
    static void _tagColorsDidChange();

    /// Overlapping dots, one a tag; empty for an empty list. `height` in points, `scale` in pixels
    /// a point.
    static platform::Image blipWithTags(const std::vector<std::string>& tags, double height,
                                        double scale);
    /// One dot of `blipHeight` at `offset` in an image of one pixel a point; empty for no tag.
    static platform::Image blipWithTag(const std::optional<std::string>& tag,
                                       platform::Size imageSize, double blipHeight,
                                       platform::Point offset);
};

} // namespace tavrin
