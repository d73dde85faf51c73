#pragma once

#include "platform/base/Value.h"

#include <optional>
#include <string>

namespace platform {

/// What a PNG of the thumbnail cache says of itself.
struct ThumbnailMarks {
    int width = 0;
    int height = 0;
    std::string uri;
    std::string date;
};

/// Reads them without decoding the picture; none when these bytes are no whole PNG.
std::optional<ThumbnailMarks> readThumbnailMarks(const Bytes& png);

} // namespace platform
