#pragma once

#include "platform/cloud/Remote.h"
#include "platform/cloud/webdav/HttpMessage.h"
#include "platform/cloud/webdav/MultiStatus.h"

#include <string>
#include <string_view>

// Private to the WebDAV remote: how versions are told apart.

namespace platform {

/// The text by which a version is known, and whether it is too young to be told from a successor.
/// With an etag it is that, whether the server calls it weak or strong by now. A server that has
/// none counts time in whole seconds, one that says "weak" in ticks: a version is young as long as
/// the server's own clock is that close.
struct DavVersion {
    std::string text;
    bool young = false;

    static DavVersion of(std::string_view etag, std::uint64_t size, std::optional<Date> modified,
                         Date serverTime);
};

inline bool isStrongEtag(std::string_view etag) {
    return etag.starts_with('"');
}

/// The header that binds a change to that version. A server that calls young versions weak takes
/// them in the long form alone.
std::string conditionOn(std::string_view version, bool weakEtags);

/// What a listing says of an item; none for what cannot be one, and `reason` says why.
std::optional<RemoteEntry> entryOf(const DavItem& item, std::string name, Date serverTime,
                                   bool etags, std::string& reason);
/// What the headers of a GET or HEAD say of a file; none when they do not tell its size. Their own
/// date counts before `serverTime`.
std::optional<RemoteEntry> entryOf(const HttpReply& reply, std::string name, Date serverTime,
                                   bool etags);

} // namespace platform
