#include "platform/files/LinkResolution.h"

#include "platform/files/PathText.h"

#include <array>
#include <cerrno>
#include <climits>
#include <unistd.h>

namespace platform {
namespace {

/// As many as the kernel follows.
constexpr int linkLimit = 40;

} // namespace

Result<Url> resolvingSymbolicLinks(const Url& item) {
    Url current = item;
    for (int i = 0; i < linkLimit; ++i) {
        std::array<char, PATH_MAX> buffer; // NOLINT: readlink() fills it
        const ssize_t length =
            ::readlink(PathText(current.path()).c_str(), buffer.data(), buffer.size());
        if (length < 0)
            return current;
        const std::string_view target(buffer.data(), static_cast<std::size_t>(length));
        std::string path(target);
        if (!target.starts_with('/'))
            path = std::string(folderOf(current.path())).append("/").append(target);
        current = Url::file(path, item.hasDirectoryMark()).standardized();
    }
    return posixError(ELOOP, item, false);
}

} // namespace platform
