#pragma once

#include "platform/ui/Image.h"

#include <string>
#include <vector>

namespace platform {

/// A run of text, or an inline picture, of a styled line.
struct StyledRun {
    std::string text;
    /// Shown instead of the text when not empty.
    Image image;
    /// Raises (positive) or lowers the text against the line's baseline, in points.
    double baselineOffset = 0;
};

/// One line of text with pictures in it. A value.
struct StyledText {
    std::vector<StyledRun> runs;
    /// The text alone, for screen readers.
    std::string plainText() const {
        std::string text;
        for (const StyledRun& run : runs)
            text += run.text;
        return text;
    }
};

} // namespace platform
