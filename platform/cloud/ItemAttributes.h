#pragma once

#include "platform/base/Result.h"
#include "platform/base/Value.h"

#include <array>
#include <cstddef>
#include <span>
#include <string_view>

namespace platform {

/// Attributes of an item of the store.
enum class ResourceKey {
    name,
    localizedName,
    typeIdentifier,
    localizedTypeDescription,
    fileSize,
    creationDate,
    contentModificationDate,
    isDirectory,
    isPackage,
    hasHiddenExtension,
    parentDirectoryUrl,
    isShared,
    sharedItemRole,
    downloadingStatus,
    /// A map of pixel size to encoded image; large, so it is asked for alone.
    thumbnailDictionary,
};
inline constexpr std::size_t resourceKeyCount = 15;

/// Values of sharedItemRole.
inline constexpr std::string_view sharedRoleOwner = "owner";
inline constexpr std::string_view sharedRoleParticipant = "participant";
/// Values of downloadingStatus.
inline constexpr std::string_view downloadingStatusNotDownloaded = "not-downloaded";
inline constexpr std::string_view downloadingStatusCurrent = "current";
/// The entry of the thumbnail dictionary with 1024 pixels a side, or fewer where no more are to be
/// had: a small picture is not enlarged, and of a promise there is what was made before.
inline constexpr std::string_view thumbnailSize1024 = "1024x1024";

/// The attributes that a read answered: one slot a key, none where the item has no such attribute.
class ResourceValues {
public:
    const Value& operator[](ResourceKey key) const {
        return values_[static_cast<std::size_t>(key)];
    }
    void set(ResourceKey key, Value value) {
        values_[static_cast<std::size_t>(key)] = std::move(value);
    }

private:
    std::array<Value, resourceKeyCount> values_;
};

using ResourceKeys = std::span<const ResourceKey>;

} // namespace platform
