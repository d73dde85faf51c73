#pragma once

#include "platform/documents/thumbnails/ThumbnailLoader.h"

#include <QImage>

#include <string_view>

namespace platform {

class PreviewToken;
class ThumbnailCache;

struct MadeThumbnail {
    /// Null for none.
    QImage image;
    /// The answer stays the same for as long as the document does.
    bool lasting = false;
};

bool makesThumbnails(std::string_view typeIdentifier);

/// Takes the picture out of the desk's cache, else makes it and leaves it there. Blocks; not for
/// the main thread.
MadeThumbnail makeThumbnail(const ThumbnailCache& cache, const ThumbnailRequest& request,
                            PreviewToken& token);

} // namespace platform
