#include "platform/base/Text.h"
#include "platform/cloud/ContentHash.h"
#include "platform/cloud/Tokens.h"
#include "platform/cloud/webdav/DavVersion.h"
#include "platform/cloud/webdav/WebDavRemote.h"
#include "platform/files/PathText.h"

#include <charconv>

namespace platform {
namespace {

/// How often a download goes on that has come no further meanwhile.
constexpr int triesWithoutProgress = 3;
/// Looks at a version that is too young, before it is taken as it is.
constexpr int looksAtMost = 15;
constexpr std::string_view checksumName = "SHA256:";

Error changedMeanwhileThere(std::string_view path) {
    return makeError(ErrorCode::changedWhileRead, nameOf(path));
}

/// "bytes 100-199/200": the first byte and the size of the whole.
std::optional<std::pair<std::uint64_t, std::uint64_t>> contentRangeOf(std::string_view text) {
    if (!text.starts_with("bytes "))
        return std::nullopt;
    text.remove_prefix(6);
    const std::size_t slash = text.find('/');
    if (slash == std::string_view::npos)
        return std::nullopt;
    std::pair<std::uint64_t, std::uint64_t> range;
    std::from_chars(text.data(), text.data() + text.size(), range.first);
    const std::string_view size = text.substr(slash + 1);
    const auto [end, error] =
        std::from_chars(size.data(), size.data() + size.size(), range.second);
    return error == std::errc() && end == size.data() + size.size() ? std::optional(range)
                                                                    : std::nullopt;
}

} // namespace

/// A content on its way here, over as many connections as it takes.
struct WebDavRemote::Download {
    const std::string& path;
    const Sink& sink;
    /// What a listing said of it, where the headers of the content do not say enough.
    std::optional<RemoteEntry> known;
    /// What is being received: of the first answer.
    std::optional<RemoteEntry> version;
    /// With what a server is asked to go on with that very version; "" when it cannot be.
    std::string validator;
    std::uint64_t received = 0;
    /// Bytes of this answer that were received before.
    std::uint64_t skip = 0;
    bool begun = false; // this answer
    /// The headers alone do not say which version this is, or it is too young.
    bool needsLook = false;
    std::string checksum;
    std::optional<ContentHash> hash;
};

Result<RemoteEntry> WebDavRemote::standing(Session& session, const std::string& path,
                                           CancelFlag& cancel) {
    if (!session.can.headTellsVersion || session.can.stableIds)
        return find(session, path, cancel);
    const HttpResult result = session.server.head(path, cancel);
    if (result.isOpen())
        return find(session, path, cancel);
    if (!result.isGood())
        return errorOf(session, result, "HEAD", path, cancel);
    std::optional<RemoteEntry> entry =
        entryOf(result.reply, std::string(nameOf(path)), session.server.now(), session.can.etags);
    if (!entry) // a folder, most likely
        return find(session, path, cancel);
    entry->tags = tagsOf(path);
    return std::move(*entry);
}

Result<RemoteEntry> WebDavRemote::settled(Session& session, const std::string& path,
                                          CancelFlag& cancel) {
    for (int look = 1;; ++look) {
        Result<RemoteEntry> entry = standing(session, path, cancel);
        if (!entry || !entry->young || look == looksAtMost)
            return entry;
        if (!session.server.pause(cancel))
            return makeError(ErrorCode::userCancelled);
    }
}

Failure WebDavRemote::begin(Session& session, Download& download, const HttpReply& head) {
    download.begun = true;
    const std::string_view encoding = head.header("content-encoding");
    if (!encoding.empty() && encoding != "identity")
        return makeErrorWithText(
            ErrorCode::serverRefused,
            localizedFormat("The server sends “%1$@” in an encoding that was not asked for.",
                            nameOf(download.path)));
    if (head.status == 206) {
        const auto range = contentRangeOf(head.header("content-range"));
        return download.version && range && range->first == download.received &&
                       range->second == download.version->size
                   ? Failure()
                   : Failure(changedMeanwhileThere(download.path));
    }
    if (head.status != 200)
        return makeErrorWithText(ErrorCode::serverRefused,
                                 "HTTP " + std::to_string(head.status));
    std::optional<RemoteEntry> told = entryOf(head, std::string(nameOf(download.path)),
                                              session.server.now(), session.can.etags);
    if (!download.known && (!told || !session.can.headTellsVersion || told->young)) {
        download.needsLook = !download.path.starts_with(remoteServiceFolder) || !told;
        if (download.needsLook)
            return changedMeanwhileThere(download.path);
    }
    if (told && download.known && session.can.headTellsVersion &&
        told->etag != download.known->etag)
        return changedMeanwhileThere(download.path);
    RemoteEntry version = download.known ? *download.known : std::move(*told);
    if (download.version && version.etag != download.version->etag)
        return changedMeanwhileThere(download.path);
    download.skip = download.received;
    const std::string_view etag = head.header("etag");
    download.validator = isStrongEtag(etag) ? etag
                         : version.young    ? std::string_view()
                                            : head.header("last-modified");
    if (download.received == 0 && head.header("oc-checksum").starts_with(checksumName)) {
        download.checksum = head.header("oc-checksum").substr(checksumName.size());
        download.hash.emplace();
    }
    download.version = std::move(version);
    return std::nullopt;
}

Failure WebDavRemote::takeBody(Session& session, Download& download, const HttpReply& head,
                               std::span<const std::byte> piece) {
    if (!download.begun)
        if (Failure failure = begin(session, download, head))
            return failure;
    const std::uint64_t known = std::min<std::uint64_t>(download.skip, piece.size());
    download.skip -= known;
    piece = piece.subspan(known);
    if (piece.empty())
        return std::nullopt;
    if (download.received + piece.size() > download.version->size)
        return changedMeanwhileThere(download.path);
    if (Failure failure = download.sink(piece))
        return failure;
    if (download.hash)
        download.hash->add(piece);
    download.received += piece.size();
    return std::nullopt;
}

Result<RemoteEntry> WebDavRemote::fetch(Session& session, Download& download, CancelFlag& cancel) {
    HttpResult result;
    for (int tries = 0; tries < triesWithoutProgress; ++tries) {
        const std::uint64_t before = download.received;
        download.begun = false;
        DavServer::Headers headers;
        if (before > 0)
            headers = {"Range: bytes=" + std::to_string(before) + '-',
                       "If-Range: " + download.validator};
        result = session.server.get(
            download.path, std::move(headers),
            [&](const HttpReply& head, std::span<const std::byte> piece) {
                return takeBody(session, download, head, piece);
            },
            cancel);
        if (result.trouble == HttpTrouble::caller && download.needsLook && !download.known) {
            const Result<RemoteEntry> found = settled(session, download.path, cancel);
            if (!found)
                return found;
            download.known = *found;
            continue;
        }
        if (result.isGood() && !download.begun) // an empty body
            if (Failure failure = takeBody(session, download, result.reply, {}))
                return *failure;
        if (result.ok() && result.reply.status == 416)
            return changedMeanwhileThere(download.path);
        if (result.ok() && !result.reply.isGood())
            return errorOf(session, result, "GET", download.path, cancel);
        if (result.ok() && download.received == download.version->size)
            return *download.version;
        if (result.ok()) // a body that was too short and ended well
            return changedMeanwhileThere(download.path);
        if (result.trouble != HttpTrouble::broken ||
            (download.received > 0 && download.validator.empty()))
            return errorOf(session, result, "GET", download.path, cancel);
        if (download.received > before)
            tries = -1;
    }
    return errorOf(session, result, "GET", download.path, cancel);
}

Result<RemoteEntry> WebDavRemote::read(const std::string& path, const Sink& sink,
                                       CancelFlag& cancel) {
    const Result<Held> held = open(cancel);
    if (!held)
        return held.error();
    Session& session = **held;
    const WebDavCapabilities& can = session.can;
    const bool service = path.starts_with(remoteServiceFolder);
    Download download{path, sink, {}, {}, {}, 0, 0, false, false, {}, {}};
    if (!can.headTellsVersion || can.stableIds ||
        (can.deadProperties && !service && !knowsTags(path))) {
        Result<RemoteEntry> known = find(session, path, cancel);
        if (known && known->young && !service)
            known = settled(session, path, cancel);
        if (!known)
            return known;
        if (known->kind != ItemKind::file)
            return changedMeanwhileThere(path);
        download.known = std::move(*known);
    }
    Result<RemoteEntry> version = fetch(session, download, cancel);
    if (!version)
        return version;
    if (download.hash && bytesOfHex(download.checksum) &&
        download.hash->finish() != *bytesOfHex(download.checksum))
        return makeErrorWithText(
            ErrorCode::serverRefused,
            localizedFormat("What the server sent of “%1$@” does not have the checksum that the "
                            "server gives. It is tried again.",
                            nameOf(path)));
    if (!can.headTellsVersion || !can.tornPutsVanish) {
        const Result<RemoteEntry> after = standing(session, path, cancel);
        if (!after || after->etag != version->etag || after->size != version->size)
            return after || after.error().is(ErrorCode::noSuchItem)
                       ? changedMeanwhileThere(path)
                       : Result<RemoteEntry>(after.error());
    }
    if (version->tags.empty())
        version->tags = tagsOf(path);
    return version;
}

} // namespace platform
