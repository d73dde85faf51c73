#pragma once

#include "platform/base/Date.h"
#include "platform/base/MainQueue.h"
#include "platform/base/Url.h"
#include "platform/ui/Image.h"

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace platform {

/// A small picture of a document as it was at a date.
struct ThumbnailRequest {
    /// The asker's own number for it.
    std::uint64_t row = 0;
    Url url;
    Date modified;
    std::string typeIdentifier;
    /// Only what was made before the content left this device can be shown; none is fetched for it.
    bool promised = false;
    /// Of the longest edge; a picture that has fewer is not enlarged.
    int pixels = 0;
    /// Pixels a point.
    double scale = 1;
    bool operator==(const ThumbnailRequest&) const = default;
};

/// Finds small pictures of documents in the desk's cache, or makes them, on a few threads that
/// yield to the screens. Belongs to the main thread; nothing of it ever waits there.
class ThumbnailLoader {
public:
    /// An empty image when there is none. Not called any more once the loader is gone.
    using Receiver = std::function<void(const ThumbnailRequest& request, const Image& image)>;

    ThumbnailLoader(MainQueue& main, Receiver receiver);
    ~ThumbnailLoader();
    ThumbnailLoader(const ThumbnailLoader&) = delete;
    ThumbnailLoader& operator=(const ThumbnailLoader&) = delete;

    /// What is wanted now, the most urgent first: takes the place of earlier wishes, of which those
    /// that are not repeated are given up.
    void want(std::vector<ThumbnailRequest> requests);

    /// Whether documents of the type have pictures at all.
    static bool makes(std::string_view typeIdentifier);
    /// What any loader answered to the same lately; none when it has to be asked for.
    static std::optional<Image> remembered(const ThumbnailRequest& request);

private:
    class Lane;
    void start();
    void take(const ThumbnailRequest& request, const Image& image, bool lasting);

    MainQueue& main_;
    const Receiver receiver_;
    std::vector<ThumbnailRequest> waiting_;
    std::vector<std::unique_ptr<Lane>> lanes_;
};

} // namespace platform
