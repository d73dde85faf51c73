#pragma once

#include "platform/base/Date.h"
#include "platform/base/Result.h"
#include "platform/base/Url.h"
#include "platform/base/Value.h"

#include <array>
#include <optional>
#include <string>
#include <string_view>

namespace platform {

/// The sizes in which the desk keeps small pictures of documents; the value is the longest edge in
/// pixels.
enum class ThumbnailSize { normal = 128, large = 256, xLarge = 512, xxLarge = 1024 };
inline constexpr std::array thumbnailSizes{ThumbnailSize::normal, ThumbnailSize::large,
                                           ThumbnailSize::xLarge, ThumbnailSize::xxLarge};
/// The smallest size with that many pixels; the largest where none has so many.
ThumbnailSize thumbnailSizeFor(int pixels);

/// The texts that a PNG of the cache carries, by their keys there.
inline constexpr std::string_view thumbnailUriKey = "Thumb::URI";
inline constexpr std::string_view thumbnailDateKey = "Thumb::MTime";

/// The pictures that all programs of the desk share, in the user's cache folder. One belongs to a
/// document by its address and its date in whole seconds, whoever made it and whether or not the
/// document itself is still on this device. A picture that is damaged, too large for its place or
/// of another document is as good as none. A value; any thread.
class ThumbnailCache {
public:
    /// `cacheFolder` is the user's ($XDG_CACHE_HOME).
    explicit ThumbnailCache(std::string_view cacheFolder);
    /// Of the installed platform.
    static ThumbnailCache current();

    /// The PNG in exactly that size.
    std::optional<Bytes> find(const Url& document, Date modified, ThumbnailSize size) const;
    /// The PNG in the largest size that there is.
    std::optional<Bytes> findLargest(const Url& document, Date modified) const;
    /// This program tried and could not make one.
    bool knowsFailure(const Url& document, Date modified) const;

    /// The picture must bear the document's texts (see uriOf, dateOf).
    Failure store(const Url& document, ThumbnailSize size, const Bytes& png) const;
    Failure storeFailure(const Url& document, const Bytes& png) const;

    /// Whether the file is a part of the cache: such a one gets no picture of its own.
    bool contains(const Url& document) const;
    static std::string uriOf(const Url& document);
    static std::string dateOf(Date modified);

private:
    std::string pathOf(const Url& document, std::string_view folder) const;
    std::optional<Bytes> read(const Url& document, Date modified, std::string_view folder,
                              int longestEdge) const;
    Failure write(const Url& document, std::string_view folder, const Bytes& png) const;

    std::string root_;
};

} // namespace platform
