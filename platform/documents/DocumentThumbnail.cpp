#include "platform/documents/DocumentThumbnail.h"

#include "platform/base/Runtime.h"
#include "platform/documents/thumbnails/ThumbnailLoader.h"
#include "platform/launch/ThumbnailCache.h"

namespace platform {

DocumentThumbnail::DocumentThumbnail(const Url& document, Date modified,
                                     const std::string& typeIdentifier, Receiver receiver) {
    ThumbnailRequest request;
    request.url = document;
    request.modified = modified;
    request.typeIdentifier = typeIdentifier;
    request.pixels = static_cast<int>(ThumbnailSize::xxLarge);
    if (!ThumbnailLoader::makes(typeIdentifier))
        return;
    loader_ = std::make_unique<ThumbnailLoader>(
        Runtime::current().mainQueue,
        [receiver = std::move(receiver)](const ThumbnailRequest&, const Image& image) {
            if (!image.empty())
                receiver(image);
        });
    loader_->want({request});
}

DocumentThumbnail::~DocumentThumbnail() = default;

} // namespace platform
