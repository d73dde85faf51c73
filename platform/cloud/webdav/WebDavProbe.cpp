#include "platform/cloud/webdav/WebDavProbe.h"

#include "platform/base/Log.h"
#include "platform/cloud/Tokens.h"
#include "platform/cloud/webdav/DavVersion.h"
#include "platform/cloud/webdav/HttpErrors.h"

namespace platform {
namespace {

constexpr std::string_view firstContent = "one";
constexpr std::string_view secondContent = "second";
constexpr std::size_t largestContent = 4096;
constexpr const char* probeTags = "probe";

bool isGoodStatus(int status) {
    return status >= 200 && status < 300;
}

} // namespace

std::string WebDavCapabilities::description() const {
    std::string text = server.empty() ? "a server" : server;
    const std::pair<bool, const char*> words[] = {
        {writable, "writable"},
        {etags, "etags"},
        {headTellsVersion, "versions by HEAD"},
        {putTellsVersion, "versions by PUT"},
        {conditionalPut, "conditional PUT"},
        {tornPutsVanish, "whole PUT"},
        {safeMoves, "safe MOVE"},
        {moveKeepsVersion, "versions over MOVE"},
        {showsHidden, "hidden names"},
        {deadProperties, "properties"},
        {append, "append"},
        {quota, "quota"},
        {stableIds, "stable ids"},
        {permissions, "permissions"},
        {checksums, "checksums"},
    };
    const char* between = ": ";
    for (const auto& [has, word] : words)
        if (has) {
            text += between;
            text += word;
            between = ", ";
        }
    return text;
}

bool WebDavProbe::went(const HttpResult& result) {
    if (!result.ok() && !failure_)
        failure_ = result.failure;
    return result.ok();
}

bool WebDavProbe::put(const std::string& file, std::string_view content,
                      DavServer::Headers headers, int& status) {
    const HttpResult result = server_.put(file, content, std::move(headers), cancel_);
    status = result.reply.status;
    etagOfPut_ = result.reply.header("etag");
    return went(result);
}

bool WebDavProbe::seen(const std::string& file, RemoteEntry& entry, std::string* tags) {
    std::optional<RemoteEntry> found;
    const HttpResult result = server_.properties(
        file, false, 0,
        [&](DavItem item) -> Failure {
            std::string reason;
            found = entryOf(item, "probe", server_.now(), true, reason);
            found_.etags = !item.etag.empty();
            found_.weakEtags = found_.weakEtags || item.etag.starts_with("W/");
            if (tags)
                *tags = item.tags;
            return std::nullopt;
        },
        cancel_);
    if (!went(result) || !found)
        return false;
    entry = std::move(*found);
    return true;
}

bool WebDavProbe::holds(const std::string& file, std::string_view content, bool& same) {
    std::string text;
    const HttpResult result = server_.read(file, largestContent, text, cancel_);
    same = result.isGood() && text == content;
    found_.checksums = found_.checksums || !result.reply.header("oc-checksum").empty();
    return went(result);
}

Result<WebDavCapabilities> WebDavProbe::run(const DavItem& root) {
    found_.quota = root.quotaAvailable.has_value();
    found_.stableIds = !root.id.empty();
    found_.permissions = !root.permissions.empty();
    const std::string file =
        std::string(remoteServiceFolder) + "/probe-" + hexText(randomBytes(6));
    const std::string other = file + "-b";
    const std::string moved = file + "-c";
    server_.askFor(true, found_.quota || found_.stableIds || found_.permissions);
    const std::string torn = file + "-d";
    const std::string hidden =
        std::string(remoteServiceFolder) + "/.probe-" + hexText(randomBytes(6));
    if (look(file) && tryConditions(file) && tearUpload(torn) && tryHidden(hidden)) {
        tryProperties(file);
        if (tryMoves(file, other, moved))
            tryAppend(other);
        lookAtTorn(torn);
    }
    if (found_.writable)
        for (const std::string& each : {file, other, moved, torn, hidden})
            server_.erase(each, false, cancel_);
    else // what listings tell is all that there is
        found_.etags = true;
    if (failure_)
        return *failure_;
    server_.askFor(found_.deadProperties,
                   found_.quota || found_.stableIds || found_.permissions);
    platformLog(LogLevel::info, "cloud: the account is on %@", found_.description());
    return std::move(found_);
}

bool WebDavProbe::look(const std::string& file) {
    const HttpResult made = server_.put(file, firstContent, {}, cancel_);
    found_.server = made.reply.header("server");
    const std::string etag(made.reply.header("etag"));
    RemoteEntry entry;
    if (made.ok() && made.reply.status >= 500 && made.reply.status != 501 &&
        made.reply.status != 507) // a fault of the moment, and no answer
        failure_ = errorOfStatus(made.reply, "PUT", file);
    if (!went(made) || !made.reply.isGood() || !seen(file, entry) ||
        entry.size != firstContent.size())
        return false;
    found_.writable = true;
    found_.putTellsVersion = found_.etags && isStrongEtag(etag) && etag == entry.etag;
    const HttpResult head = server_.head(file, cancel_);
    if (!went(head))
        return false;
    const auto told = entryOf(head.reply, "probe", server_.now(), found_.etags);
    found_.headTellsVersion = head.reply.isGood() && told && told->size == entry.size &&
                              told->etag == entry.etag;
    return true;
}

bool WebDavProbe::tryConditions(const std::string& file) {
    int taken = 0;
    int wrong = 0;
    int right = 0;
    RemoteEntry before;
    if (!put(file, "not this", {"If-None-Match: *"}, taken) ||
        !put(file, "nor this", {"If-Match: \"never-was\""}, wrong) || !seen(file, before))
        return false;
    bool kept = false;
    if (!holds(file, firstContent, kept))
        return false;
    if (!put(file, secondContent, {conditionOn(before.etag, found_.weakEtags)}, right))
        return false;
    bool made = false;
    if (!holds(file, secondContent, made))
        return false;
    found_.conditionalPut =
        found_.etags && taken == 412 && wrong == 412 && kept && isGoodStatus(right) && made;
    return made || put(file, secondContent, {}, right);
}

/// Breaks an upload off in the middle. Whether its first half is ever seen is looked at here and
/// once more at the end. The file is of no other use: the server may be busy with the rest.
bool WebDavProbe::tearUpload(const std::string& file) {
    int status = 0;
    if (!put(file, secondContent, {}, status))
        return false;
    CancelFlag tear;
    const HttpUpload upload{
        secondContent.size() * 2,
        [&](std::uint64_t offset, std::span<std::byte> buffer) -> Result<std::size_t> {
            if (offset > 0)
                return makeError(ErrorCode::userCancelled);
            buffer[0] = std::byte{'x'};
            return std::size_t{1};
        }};
    server_.put(file, upload, {}, tear);
    found_.tornPutsVanish = true;
    return lookAtTorn(file);
}

bool WebDavProbe::lookAtTorn(const std::string& file) {
    std::string text;
    const HttpResult left = server_.read(file, largestContent, text, cancel_);
    found_.tornPutsVanish = found_.tornPutsVanish && left.isGood() && text == secondContent;
    return left.isOpen() || went(left); // what is torn may have no end
}

/// Some servers hide names that begin with a dot, which then look as if they had been deleted.
bool WebDavProbe::tryHidden(const std::string& file) {
    int status = 0;
    if (!put(file, firstContent, {}, status))
        return false;
    const HttpResult listed = server_.properties(
        remoteServiceFolder, true, 1,
        [&](const DavItem& item) -> Failure {
            const std::optional<std::string> path = pathOfHref(item.href);
            found_.showsHidden = found_.showsHidden || (path && path->ends_with(file));
            return std::nullopt;
        },
        cancel_);
    return went(listed);
}

void WebDavProbe::tryProperties(const std::string& file) {
    int status = 0;
    std::string tags;
    RemoteEntry entry;
    const HttpResult set = server_.setTags(file, probeTags, cancel_);
    if (!went(set) || !set.reply.isGood() || !put(file, secondContent, {}, status) ||
        !seen(file, entry, &tags))
        return;
    found_.deadProperties = tags == probeTags;
}

bool WebDavProbe::tryMoves(const std::string& file, const std::string& other,
                           const std::string& moved) {
    int status = 0;
    if (!put(other, firstContent, {}, status))
        return false;
    const HttpResult onto = server_.move(other, file, false, cancel_);
    bool kept = false;
    bool stayed = false;
    if (!went(onto) || !holds(file, secondContent, kept) || !holds(other, firstContent, stayed))
        return false;
    RemoteEntry before;
    RemoteEntry after;
    std::string tags;
    if (!seen(file, before))
        return false;
    const HttpResult away = server_.move(file, moved, false, cancel_);
    if (!went(away) || !seen(moved, after, &tags))
        return false;
    bool whole = false;
    if (!holds(moved, secondContent, whole))
        return false;
    found_.safeMoves = onto.reply.status == 412 && kept && stayed && away.reply.isGood() && whole;
    found_.moveKeepsVersion = before.etag == after.etag;
    found_.moveKeepsDate = before.modified == after.modified;
    found_.deadProperties = found_.deadProperties && tags == probeTags;
    return true;
}

void WebDavProbe::tryAppend(const std::string& file) {
    int status = 0;
    const std::string range = "Content-Range: bytes 3-5/6";
    bool grown = false;
    if (put(file, "two", {range}, status) && holds(file, "onetwo", grown))
        found_.append = grown;
}

} // namespace platform
