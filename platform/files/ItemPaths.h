#pragma once

#include "platform/base/Url.h"

#include <string>
#include <string_view>

namespace platform {

/// Under what name coordination knows an item: the path without ".", ".." and doubled slashes, by
/// text alone. Links on the way to the item are not resolved.
inline std::string standardPath(const Url& item) {
    const std::string& path = item.path();
    // Almost every path is in that form already.
    if (path.find("//") == std::string::npos && path.find("/.") == std::string::npos)
        return path;
    return item.standardized().path();
}

/// True when `path` is `folder` or lies below it.
inline bool isAtOrBelow(std::string_view path, std::string_view folder) {
    if (!path.starts_with(folder))
        return false;
    return path.size() == folder.size() || folder == "/" || path[folder.size()] == '/';
}

/// True when one of the two is the other or lies below it.
inline bool pathsMeet(std::string_view a, std::string_view b) {
    return isAtOrBelow(a, b) || isAtOrBelow(b, a);
}

/// Where `path` is after `from` became `to`; unchanged when it is not at or below `from`.
inline std::string movedPath(std::string_view path, std::string_view from, std::string_view to) {
    if (!isAtOrBelow(path, from))
        return std::string(path);
    return std::string(to).append(path.substr(from.size()));
}

} // namespace platform
