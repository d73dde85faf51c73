#include "platform/base/Text.h"
#include "platform/files/FileManager.h"
#include "platform/files/PathText.h"

#include <array>
#include <cerrno>
#include <sys/xattr.h>

namespace platform {
namespace {

Error attributeError(int number, const Url& item) {
    if (number == ENOTSUP || number == E2BIG || number == ERANGE)
        return cannotError(
            number, localizedFormat("The disk that holds “%1$@” cannot keep this information.",
                                    item.lastPathComponent()));
    return posixError(number, item, true);
}

} // namespace

std::optional<std::string> extendedAttribute(std::string_view path, const char* name,
                                             FollowLinks follow) {
    const PathText text(path);
    const auto read = [&](char* out, std::size_t size) {
        return follow == FollowLinks::yes ? ::getxattr(text.c_str(), name, out, size)
                                          : ::lgetxattr(text.c_str(), name, out, size);
    };
    std::array<char, 256> usual{};
    ssize_t length = read(usual.data(), usual.size());
    if (length >= 0)
        return std::string(usual.data(), static_cast<std::size_t>(length));
    std::string value;
    // It may grow between the question for its size and the reading.
    while (length < 0 && errno == ERANGE) {
        length = read(nullptr, 0);
        if (length <= 0)
            break; // gone or emptied meanwhile
        value.resize(static_cast<std::size_t>(length));
        length = read(value.data(), value.size());
    }
    if (length < 0)
        return std::nullopt;
    value.resize(static_cast<std::size_t>(length));
    return value;
}

Failure setExtendedAttribute(const Url& item, const char* name, std::string_view value) {
    if (::setxattr(PathText(item.path()).c_str(), name, value.data(), value.size(), 0) == 0)
        return std::nullopt;
    return attributeError(errno, item);
}

Failure removeExtendedAttribute(const Url& item, const char* name) {
    if (::removexattr(PathText(item.path()).c_str(), name) == 0 || errno == ENODATA)
        return std::nullopt;
    return attributeError(errno, item);
}

} // namespace platform
