#pragma once

#include "platform/base/Value.h"

#include <string_view>

namespace platform {

/// Posted when another device or program changed the store, on the main thread.
inline constexpr std::string_view keyValueStoreDidChangeExternallyNotification =
    "KeyValueStoreDidChangeExternallyNotification";

/// A small set of values that follows the user's account. The last writer of a key wins; other keys
/// are never lost. Safe from any thread.
class KeyValueCloudStore {
public:
    virtual ~KeyValueCloudStore() = default;
    /// None when there is no such key.
    virtual Value value(std::string_view key) const = 0;
    /// A none value removes the key.
    virtual void setValue(std::string_view key, Value value) = 0;
};

} // namespace platform
