#include "platform/documents/thumbnails/ThumbnailMemory.h"

#include <cmath>

namespace platform {
namespace {

/// Some thousand rows of a list.
constexpr std::size_t mostBytes = 16 * 1024 * 1024;
/// One that fills a screen would push out those of a hundred rows.
constexpr std::size_t largestImage = mostBytes / 64;
/// What an entry costs besides its pixels.
constexpr std::size_t entryBytes = 512;

std::string keyOf(const ThumbnailRequest& request) {
    return request.url.path() + '\0' + std::to_string(request.modified.nanoseconds) + ' ' +
           std::to_string(request.pixels) + ' ' + std::to_string(request.scale) +
           (request.promised ? " promised" : "");
}

std::size_t sizeOf(const Image& image) {
    const Size size = image.size();
    const double pixels = size.width * size.height * image.scale() * image.scale();
    return entryBytes + 4 * static_cast<std::size_t>(std::lround(pixels));
}

} // namespace

std::optional<Image> ThumbnailMemory::find(const ThumbnailRequest& request) {
    const auto found = byKey_.find(keyOf(request));
    if (found == byKey_.end())
        return std::nullopt;
    entries_.splice(entries_.begin(), entries_, found->second);
    return found->second->image;
}

void ThumbnailMemory::keep(const ThumbnailRequest& request, const Image& image) {
    const std::size_t bytes = sizeOf(image);
    if (bytes > largestImage)
        return;
    std::string key = keyOf(request);
    if (const auto found = byKey_.find(key); found != byKey_.end()) {
        bytes_ -= found->second->bytes;
        entries_.erase(found->second);
        byKey_.erase(found);
    }
    entries_.push_front({key, image, bytes});
    byKey_.emplace(std::move(key), entries_.begin());
    bytes_ += bytes;
    while (bytes_ > mostBytes) {
        bytes_ -= entries_.back().bytes;
        byKey_.erase(entries_.back().key);
        entries_.pop_back();
    }
}

} // namespace platform
