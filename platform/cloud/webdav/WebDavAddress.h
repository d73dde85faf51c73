#pragma once

#include "platform/base/Result.h"

#include <optional>
#include <string>
#include <string_view>

namespace platform {

/// Where a WebDAV account lies: an origin and the folder on it that is the account's root. Paths of
/// items are bytes; on their way they are percent-encoded, a segment at a time. A value.
struct WebDavAddress {
    /// "https://host[:port]", without a slash at the end. Never with a user or a password.
    std::string origin;
    /// Decoded, with a slash at the beginning and none at the end; "" for the server's root.
    std::string folder;

    /// From what people type. Refuses, with words, other schemes than http and https, and addresses
    /// with a user, a password, a query or a fragment in them.
    static Result<WebDavAddress> parse(std::string_view text);

    bool isEncrypted() const { return origin.starts_with("https:"); }
    /// The address of the item at that path of the account ("" is its root); a folder's ends in a
    /// slash.
    std::string urlOf(std::string_view path, bool isFolder) const;
    /// The account's root as text for people and for account.json.
    std::string text() const { return urlOf("", true); }
};

/// Decoded segments, joined by slashes, with one in front; "" for the server's root. Answers none
/// for what names no path: broken percent-encoding, a segment with a slash or NUL in it, "." or
/// "..". Takes a whole URL as well as a path.
std::optional<std::string> pathOfHref(std::string_view href);

} // namespace platform
