#include "platform/cloud/webdav/DavVersion.h"

#include "platform/base/Text.h"
#include "platform/cloud/NameFolding.h"
#include "platform/cloud/Sidecar.h"
#include "platform/cloud/Tokens.h"

namespace platform {
namespace {

/// Dates are told in whole seconds, on both sides of the difference.
constexpr double youngSeconds = 2;

} // namespace

DavVersion DavVersion::of(std::string_view etag, std::uint64_t size, std::optional<Date> modified,
                          Date serverTime) {
    if (isStrongEtag(etag))
        return {std::string(etag), false};
    const bool young = !modified || serverTime.secondsSince(*modified) < youngSeconds;
    if (!etag.empty())
        return {std::string(etag.starts_with("W/") ? etag.substr(2) : etag), young};
    return {hexText(size) + '-' +
                hexText(static_cast<std::uint64_t>(modified.value_or(Date{}).wholeSeconds())),
            young};
}

std::string conditionOn(std::string_view version, bool weakEtags) {
    const std::string text(version);
    return weakEtags ? "If: ([" + text + "]) ([W/" + text + "])" : "If-Match: " + text;
}

std::optional<RemoteEntry> entryOf(const DavItem& item, std::string name, Date serverTime,
                                   bool etags, std::string& reason) {
    if (!isUtf8(name))
        reason = localized("Its name is not valid UTF-8.");
    else if (hasSidecarForm(name))
        reason =
            localized("Names that begin with “.” and end in “.promise” are kept for promises.");
    else if (item.status == 401 || item.status == 403)
        reason = localized("The server does not allow it to be read.");
    else if (!item.isCollection && !item.size)
        reason = localized("The server does not tell its size.");
    if (!reason.empty())
        return std::nullopt;
    RemoteEntry entry;
    entry.name = std::move(name);
    entry.kind = item.isCollection ? ItemKind::folder : ItemKind::file;
    const std::optional<Date> modified = dateOfHttpText(item.modified);
    entry.modified = modified.value_or(serverTime);
    entry.remoteId = item.id;
    entry.tags = item.tags;
    if (item.permissions.find('S') != std::string::npos)
        entry.role = SharedRole::participant;
    if (item.isCollection)
        return entry; // that there is a folder is all that can be agreed on
    entry.size = *item.size;
    DavVersion version = DavVersion::of(etags ? std::string_view(item.etag) : std::string_view(),
                                        entry.size, modified, serverTime);
    entry.etag = std::move(version.text);
    entry.young = version.young;
    return entry;
}

std::optional<RemoteEntry> entryOf(const HttpReply& reply, std::string name, Date serverTime,
                                   bool etags) {
    const std::optional<std::uint64_t> size = reply.number("content-length");
    if (!size)
        return std::nullopt;
    RemoteEntry entry;
    entry.name = std::move(name);
    entry.size = *size;
    const std::optional<Date> modified = dateOfHttpText(reply.header("last-modified"));
    entry.modified = modified.value_or(serverTime);
    DavVersion version = DavVersion::of(etags ? reply.header("etag") : std::string_view(), *size,
                                        modified, reply.date().value_or(serverTime));
    entry.etag = std::move(version.text);
    entry.young = version.young;
    return entry;
}

} // namespace platform
