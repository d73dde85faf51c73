#include "platform/base/Log.h"
#include "platform/cloud/ContentHash.h"
#include "platform/cloud/webdav/DavVersion.h"
#include "platform/cloud/webdav/WebDavRemote.h"
#include "platform/files/PathText.h"

namespace platform {
namespace {

/// Up to that size a content is read back to prove that it is ours, where nothing else proves it.
constexpr std::uint64_t provableSize = std::uint64_t{256} * 1024;

Error changedThere(std::string_view path) {
    return makeError(ErrorCode::changedRemotely, nameOf(path));
}

} // namespace

/// A content on its way there.
struct WebDavRemote::Upload {
    const std::string& path;
    const RemoteUpload& content;
    const RemoteCondition& condition;
    ContentHash hash = {};
    std::uint64_t hashed = 0;
    std::optional<Bytes> finished = {};

    /// As the server's connection reads it; may begin anew.
    HttpUpload body(bool hashing) {
        return {content.size,
                [this, hashing](std::uint64_t offset,
                                std::span<std::byte> buffer) -> Result<std::size_t> {
                    const Result<std::size_t> got = content.read(offset, buffer);
                    if (got && hashing && offset == hashed) {
                        hash.add(buffer.first(*got));
                        hashed += *got;
                    }
                    return got;
                }};
    }
    Bytes digest() {
        if (!finished)
            finished = hash.finish();
        return *finished;
    }
    bool isSmall() const { return content.size <= provableSize; }
};

Result<RemoteEntry> WebDavRemote::write(const std::string& path, const RemoteUpload& content,
                                        const RemoteCondition& condition, CancelFlag& cancel) {
    const Result<Held> held = open(cancel);
    if (!held)
        return held.error();
    Session& session = **held;
    if (Failure failure = checkChange(session, path))
        return *failure;
    Upload upload{path, content, condition};
    // What tells a PUT's own version, or can be read back, needs no way round.
    const bool direct = session.can.directUploads() &&
                        (session.can.putTellsVersion || upload.isSmall() || !session.can.safeMoves);
    return direct ? writeDirectly(session, upload, cancel) : writeInSteps(session, upload, cancel);
}

Result<RemoteEntry> WebDavRemote::writeDirectly(Session& session, Upload& upload,
                                                CancelFlag& cancel) {
    const std::optional<std::string>& version = upload.condition.etag;
    const HttpResult put = session.server.put(
        upload.path, upload.body(upload.isSmall()),
        {version ? conditionOn(*version, session.can.weakEtags) : "If-None-Match: *"}, cancel);
    if (put.ok() && (put.reply.status == 412 || put.reply.status == 405))
        return version ? changedThere(upload.path)
                       : makeError(ErrorCode::fileExists, nameOf(upload.path));
    if (!put.isMade() && !put.isOpen())
        return refusal(session, put, "PUT", upload.path, cancel);
    Result<RemoteEntry> entry = standing(session, upload.path, cancel);
    const std::string told =
        session.can.putTellsVersion
            ? DavVersion::of(put.reply.header("etag"), 0, Date{}, Date{}).text
            : std::string();
    if (put.isOpen()) {
        // The answer got lost. What stands there tells whether it was made.
        if (!entry || !upload.isSmall() || upload.hashed != upload.content.size ||
            prove(session, {upload.path, *entry, upload.digest()}, cancel))
            return refusal(session, put, "PUT", upload.path, cancel);
    } else if (!entry) {
        return entry;
    } else if (entry->size != upload.content.size || (!told.empty() && told != entry->etag)) {
        return changedThere(upload.path); // somebody else's by now
    }
    const bool proven = put.isMade() && !told.empty() && !entry->young;
    return accept(session, upload, std::move(*entry), proven, cancel);
}

/// The tags follow, and what is not proven yet is remembered until it is.
Result<RemoteEntry> WebDavRemote::accept(Session& session, Upload& upload, RemoteEntry entry,
                                         bool proven, CancelFlag& cancel) {
    if (session.can.deadProperties && upload.content.tags != tagsOf(upload.path) &&
        !upload.path.starts_with(remoteServiceFolder))
        sendTags(session, upload.path, upload.path, upload.content.tags, cancel);
    entry.tags = tagsOf(upload.path);
    const std::lock_guard lock(mutex_);
    std::erase_if(unproven_, [&](const Unproven& content) { return content.path == upload.path; });
    if (!proven && upload.isSmall() && upload.hashed == upload.content.size)
        unproven_.push_back({upload.path, entry, upload.digest()});
    return entry;
}

void WebDavRemote::sendTags(Session& session, const std::string& place, const std::string& path,
                            const std::string& tags, CancelFlag& cancel) {
    if (session.server.setTags(place, tags, cancel).isGood())
        noteTags(path, tags);
    else
        platformLog(LogLevel::warning, "cloud: the tags of “%@” did not reach the server", path);
}

Result<RemoteEntry> WebDavRemote::sendHidden(Session& session, Upload& upload,
                                             const std::string& place, CancelFlag& cancel) {
    const HttpResult put =
        session.server.put(place, upload.body(upload.isSmall()), {}, cancel);
    if (!put.isMade() && !put.isOpen()) {
        session.trash.forget(place);
        return refusal(session, put, "PUT", upload.path, cancel);
    }
    if (put.isMade() && session.can.deadProperties && !upload.content.tags.empty())
        sendTags(session, place, upload.path, upload.content.tags, cancel);
    // What is large is not read once more; where time alone tells versions, it is waited for.
    const bool wait = !upload.isSmall() && !session.can.etags;
    Result<RemoteEntry> sent =
        wait ? settled(session, place, cancel) : standing(session, place, cancel);
    if (put.isOpen() && (!sent || sent->size != upload.content.size))
        return refusal(session, put, "PUT", upload.path, cancel);
    if (sent && sent->size != upload.content.size)
        return makeError(ErrorCode::changedWhileRead, nameOf(upload.path));
    return sent;
}

Result<RemoteEntry> WebDavRemote::writeInSteps(Session& session, Upload& upload,
                                               CancelFlag& cancel) {
    std::optional<RemoteEntry> before;
    if (upload.condition.etag) { // before the work; it is looked at again when it is displaced
        Result<RemoteEntry> standing =
            checkVersion(session, upload.path, *upload.condition.etag, cancel);
        if (!standing)
            return standing;
        before = std::move(*standing);
    }
    std::string place;
    const HttpResult folder = session.trash.incoming(place, cancel);
    if (!folder.isGood())
        return refusal(session, folder, "MKCOL", upload.path, cancel);
    const Result<RemoteEntry> sent = sendHidden(session, upload, place, cancel);
    Failure failure = sent ? Failure() : Failure(sent.error());
    if (!failure && before) {
        failure = replaceInSteps(session, upload, place, *sent, *before, cancel);
    } else if (!failure) {
        const HttpResult moved = moveSurely(session, place, upload.path, *sent, cancel);
        if (moved.ok() && moved.reply.status == 412)
            failure = makeError(ErrorCode::fileExists, nameOf(upload.path));
        else if (!moved.isMade())
            failure = refusal(session, moved, "MOVE", upload.path, cancel);
    }
    if (failure) {
        session.server.erase(place, false, cancel); // else the month's end removes it
        return *failure;
    }
    Result<RemoteEntry> entry = standing(session, upload.path, cancel);
    if (!entry)
        return entry;
    if (entry->size != sent->size ||
        (session.can.moveKeepsVersion && entry->etag != sent->etag))
        return changedThere(upload.path); // somebody else's by now
    const bool proven = session.can.moveKeepsVersion && !entry->young;
    return accept(session, upload, std::move(*entry), proven, cancel);
}

Failure WebDavRemote::replaceInSteps(Session& session, Upload& upload, const std::string& place,
                                     const RemoteEntry& sent, const RemoteEntry& before,
                                     CancelFlag& cancel) {
    const Result<std::string> trashed = displace(session, upload.path, before, cancel);
    if (!trashed)
        return trashed.error();
    const HttpResult moved = moveSurely(session, place, upload.path, sent, cancel);
    if (moved.isMade())
        return std::nullopt;
    if (moved.ok() && moved.reply.status == 412)
        return changedThere(upload.path); // somebody's new one stays
    Error failure = refusal(session, moved, "MOVE", upload.path, cancel);
    if (Failure lost = putBack(session, *trashed, upload.path, false, cancel))
        return lost;
    return failure;
}

Failure WebDavRemote::prove(Session& session, const Unproven& content, CancelFlag& cancel) {
    ContentHash hash;
    bool other = false;
    const HttpResult result = session.server.get(
        content.path, {},
        [&](const HttpReply& head, std::span<const std::byte> piece) -> Failure {
            const auto told = entryOf(head, "", session.server.now(), session.can.etags);
            other = other || (session.can.headTellsVersion && told &&
                              told->etag != content.entry.etag);
            hash.add(piece);
            return std::nullopt;
        },
        cancel);
    if (!result.isGood())
        return errorOf(session, result, "GET", content.path, cancel);
    if (other || hash.finish() != content.hash)
        return changedThere(content.path);
    return std::nullopt;
}

void WebDavRemote::renameUnproven(const std::string& from, const std::string& to) {
    const std::lock_guard lock(mutex_);
    for (Unproven& content : unproven_)
        if (content.path == from || content.path.starts_with(from + '/'))
            content.path = to + content.path.substr(from.size());
}

Failure WebDavRemote::sync(CancelFlag& cancel) {
    const Result<Held> held = open(cancel);
    if (!held)
        return held.error();
    const std::lock_guard one(proving_);
    std::vector<Unproven> contents;
    {
        const std::lock_guard lock(mutex_);
        contents.swap(unproven_);
    }
    // What another call could not prove may be among what this one is asked for.
    Failure failure = std::exchange(doubt_, std::nullopt);
    if (contents.empty())
        return failure;
    // From the moment on at which the last of them is old enough no successor can look like it.
    const Result<RemoteEntry> last = settled(**held, contents.back().path, cancel);
    for (const Unproven& content : contents) {
        if (cancel.isCancelled())
            doubt_ = makeError(ErrorCode::userCancelled);
        else if (Failure unproven = prove(**held, content, cancel))
            doubt_ = std::move(unproven);
        if (doubt_)
            return doubt_;
    }
    return failure;
}

} // namespace platform
