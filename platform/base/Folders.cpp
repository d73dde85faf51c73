#include "platform/base/Folders.h"

#include <cstdlib>
#include <pwd.h>
#include <unistd.h>

namespace platform {
namespace {

std::string homeOfUser() {
    const passwd* entry = getpwuid(getuid());
    return entry && entry->pw_dir && entry->pw_dir[0] == '/' ? entry->pw_dir : "/tmp";
}

} // namespace

Folders Folders::fromEnvironment(const Environment& environment) {
    const auto absolute = [&](const char* name) -> std::optional<std::string> {
        std::optional<std::string> value = environment(name);
        if (!value || !value->starts_with('/'))
            return std::nullopt;
        while (value->size() > 1 && value->ends_with('/'))
            value->pop_back();
        return value;
    };
    Folders folders;
    folders.home = absolute("HOME").value_or(homeOfUser());
    folders.config = absolute("XDG_CONFIG_HOME").value_or(folders.home + "/.config");
    folders.data = absolute("XDG_DATA_HOME").value_or(folders.home + "/.local/share");
    folders.state = absolute("XDG_STATE_HOME").value_or(folders.home + "/.local/state");
    folders.cache = absolute("XDG_CACHE_HOME").value_or(folders.home + "/.cache");
    folders.runtime = absolute("XDG_RUNTIME_DIR");
    return folders;
}

Folders Folders::fromProcessEnvironment() {
    return fromEnvironment([](const char* name) -> std::optional<std::string> {
        const char* value = std::getenv(name);
        return value ? std::optional<std::string>(value) : std::nullopt;
    });
}

} // namespace platform
