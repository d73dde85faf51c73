#pragma once

#include "platform/base/Date.h"
#include "platform/base/Url.h"
#include "platform/ui/Image.h"

#include <functional>
#include <memory>
#include <string>

namespace platform {

class ThumbnailLoader;

/// Makes the large picture of one document in the background, for as long as the object lives; what
/// it made is in the document's thumbnail dictionary from then on. Main thread.
class DocumentThumbnail {
public:
    /// Called at most once, with a picture.
    using Receiver = std::function<void(const Image& image)>;

    DocumentThumbnail(const Url& document, Date modified, const std::string& typeIdentifier,
                      Receiver receiver);
    ~DocumentThumbnail();
    DocumentThumbnail(const DocumentThumbnail&) = delete;
    DocumentThumbnail& operator=(const DocumentThumbnail&) = delete;

private:
    std::unique_ptr<ThumbnailLoader> loader_;
};

} // namespace platform
