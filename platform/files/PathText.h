#pragma once

#include "platform/base/Error.h"

#include <array>
#include <cstring>
#include <string>
#include <string_view>

namespace platform {

/// A path as the system calls want it: terminated, without an allocation for the usual lengths. A
/// path with a NUL inside would name another item, so it becomes "", which names none.
class PathText {
public:
    explicit PathText(std::string_view path) {
        if (path.find('\0') != std::string_view::npos)
            path = {};
        if (path.size() < short_.size()) {
            path.copy(short_.data(), path.size());
            short_[path.size()] = '\0';
        } else {
            long_ = path;
        }
    }
    const char* c_str() const { return long_.empty() ? short_.data() : long_.c_str(); }

private:
    std::array<char, 256> short_;
    std::string long_;
};

/// The folder part of a path ("/" for what lies at the root) and the name part.
inline std::string_view folderOf(std::string_view path) {
    const std::size_t slash = path.rfind('/');
    if (slash == std::string_view::npos)
        return ".";
    return slash == 0 ? path.substr(0, 1) : path.substr(0, slash);
}
/// The path of a name in a folder; "" is the folder that relative paths begin at.
inline std::string joinedPath(std::string_view folder, std::string_view name) {
    std::string path(folder);
    if (!path.empty())
        path += '/';
    return path.append(name);
}
inline std::string_view nameOf(std::string_view path) {
    const std::size_t slash = path.rfind('/');
    return slash == std::string_view::npos ? path : path.substr(slash + 1);
}

inline Error readError(int number, std::string_view path) {
    return posixError(number, Url::file(path), false);
}
inline Error writeError(int number, std::string_view path) {
    return posixError(number, Url::file(path), true);
}
/// An error for what this file system cannot do, with the system's own reason.
inline Error cannotError(int number, std::string text) {
    Error error = makeErrorWithText(ErrorCode::unsupportedOperation, std::move(text));
    error.localizedFailureReason = std::strerror(number); // NOLINT(concurrency-mt-unsafe)
    return error;
}

} // namespace platform
