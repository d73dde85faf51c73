#pragma once

#include "platform/documents/thumbnails/ThumbnailLoader.h"

#include <list>
#include <unordered_map>

namespace platform {

/// The pictures that were shown last, up to a number of bytes; the longest unused goes first. Main
/// thread.
class ThumbnailMemory {
public:
    std::optional<Image> find(const ThumbnailRequest& request);
    void keep(const ThumbnailRequest& request, const Image& image);

private:
    struct Entry {
        std::string key;
        Image image;
        std::size_t bytes;
    };
    std::list<Entry> entries_; // the last used in front
    std::unordered_map<std::string, std::list<Entry>::iterator> byKey_;
    std::size_t bytes_ = 0;
};

} // namespace platform
