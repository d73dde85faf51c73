#pragma once

#include <functional>
#include <optional>
#include <string>

namespace platform {

/// The user's base directories: absolute paths without a trailing slash.
struct Folders {
    std::string home;
    std::string config;
    std::string data;
    std::string state;
    std::string cache;
    /// Only when $XDG_RUNTIME_DIR is set: it has no default.
    std::optional<std::string> runtime;

    using Environment = std::function<std::optional<std::string>(const char* name)>;
    /// From $XDG_CONFIG_HOME and its kin, with their documented defaults below $HOME. A value that
    /// is not an absolute path is ignored.
    static Folders fromEnvironment(const Environment& environment);
    static Folders fromProcessEnvironment();
};

} // namespace platform
