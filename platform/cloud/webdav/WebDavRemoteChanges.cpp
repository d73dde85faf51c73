#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/cloud/NameFolding.h"
#include "platform/cloud/RemoteNames.h"
#include "platform/cloud/SyncNames.h"
#include "platform/cloud/webdav/WebDavRemote.h"
#include "platform/files/PathText.h"

namespace platform {
namespace {

/// How many names beside its own are tried for what was displaced by mistake.
constexpr int namesBeside = 20;

/// The name is not there, whatever else the server is busy with.
bool isSurelyGone(const Result<RemoteEntry>& entry) {
    return !entry && entry.error().is(ErrorCode::noSuchItem);
}

} // namespace

Failure WebDavRemote::checkChange(const Session& session, const std::string& path) const {
    const std::string_view name = nameOf(path);
    if (Failure problem = remoteNameProblem(path, name))
        return problem;
    if (!isUtf8(name))
        return nameRefusedError(
            name, localized("The name is not valid UTF-8, and a WebDAV server takes no other."));
    if (name.starts_with('.') && !session.can.showsHidden &&
        !path.starts_with(remoteServiceFolder))
        return nameRefusedError(
            name, localized("The server does not list names that begin with a dot, so that the "
                            "item would look deleted."));
    if (!session.can.writable)
        return makeErrorWithText(
            ErrorCode::writeNoPermission,
            localizedFormat("The account on the server takes no changes; “%1$@” stays as it is "
                            "there.",
                            name));
    if (!session.can.takesChanges())
        return makeErrorWithText(
            ErrorCode::unsupportedOperation,
            localized("The server replaces what stands at a name without being asked to. Nothing "
                      "is changed on it."));
    return std::nullopt;
}

Result<RemoteEntry> WebDavRemote::checkVersion(Session& session, const std::string& path,
                                               const std::string& etag, CancelFlag& cancel) {
    Result<RemoteEntry> standing = this->standing(session, path, cancel);
    if (standing && (standing->kind != ItemKind::file || standing->etag != etag))
        return makeError(ErrorCode::changedRemotely, nameOf(path));
    return standing;
}

bool WebDavRemote::isSame(Session& session, const std::string& place, const RemoteEntry& before,
                          CancelFlag& cancel) {
    const Result<RemoteEntry> now = find(session, place, cancel);
    if (!now || now->kind != before.kind)
        return false;
    if (before.kind == ItemKind::folder)
        return now->remoteId == before.remoteId;
    if (session.can.moveKeepsVersion)
        return now->etag == before.etag;
    return now->size == before.size &&
           (!session.can.moveKeepsDate || now->modified == before.modified);
}

HttpResult WebDavRemote::moveSurely(Session& session, const std::string& from,
                                    const std::string& to, const RemoteEntry& item,
                                    CancelFlag& cancel) {
    const bool folder = item.kind == ItemKind::folder;
    HttpResult result = session.server.move(from, to, folder, cancel);
    // The answer may have got lost, and the request been sent a second time by the connection.
    const bool open = result.isOpen() ||
                      (result.ok() && !result.isMade() && result.reply.status != 403);
    if (!open || !isSurelyGone(find(session, from, cancel)) || !isSame(session, to, item, cancel))
        return result;
    return {{}, {}, HttpReply{201, {}, {}}};
}

Result<RemoteEntry> WebDavRemote::makeFolder(const std::string& path, CancelFlag& cancel) {
    const Result<Held> held = open(cancel);
    if (!held)
        return held.error();
    if (Failure failure = checkChange(**held, path))
        return *failure;
    const HttpResult made = (*held)->server.makeFolder(path, cancel);
    if (!made.isMade())
        return refusal(**held, made, "MKCOL", path, cancel);
    Result<RemoteEntry> entry = find(**held, path, cancel);
    if (entry && entry->kind != ItemKind::folder)
        return makeError(ErrorCode::fileExists, nameOf(path));
    return entry;
}

Result<RemoteEntry> WebDavRemote::move(const std::string& from, const std::string& to,
                                       const std::string& etag, CancelFlag& cancel) {
    const Result<Held> held = open(cancel);
    if (!held)
        return held.error();
    Session& session = **held;
    for (const std::string* path : {&from, &to})
        if (Failure failure = checkChange(session, *path))
            return *failure;
    Result<RemoteEntry> before =
        etag.empty() ? find(session, from, cancel) : checkVersion(session, from, etag, cancel);
    if (!before)
        return before;
    if (!session.can.safeMoves && !isSurelyGone(find(session, to, cancel)))
        return makeError(ErrorCode::fileExists, nameOf(to));
    const HttpResult moved = moveSurely(session, from, to, *before, cancel);
    if (moved.ok() && moved.reply.status == 412)
        return makeError(ErrorCode::fileExists, nameOf(to));
    if (!moved.isMade())
        return refusal(session, moved, "MOVE", to, cancel);
    if (!etag.empty() && !isSame(session, to, *before, cancel)) {
        // Changed or replaced in the last moment: it stays where whoever did that knows it.
        if (Failure lost = putBack(session, to, from, false, cancel))
            return *lost;
        return makeError(ErrorCode::changedRemotely, nameOf(from));
    }
    renameUnproven(from, to);
    noteTags(to, tagsOf(from));
    noteTags(from, "");
    return find(session, to, cancel);
}

Failure WebDavRemote::remove(const std::string& path, ItemKind kind, const std::string& etag,
                             CancelFlag& cancel) {
    const Result<Held> held = open(cancel);
    if (!held)
        return held.error();
    Session& session = **held;
    if (Failure failure = checkChange(session, path))
        return failure;
    if (kind == ItemKind::folder)
        return removeFolder(session, path, cancel);
    const Result<RemoteEntry> before = checkVersion(session, path, etag, cancel);
    if (!before)
        return before.error();
    const Result<std::string> trashed = displace(session, path, *before, cancel);
    if (!trashed)
        return trashed.error();
    renameUnproven(path, *trashed);
    noteTags(path, "");
    return std::nullopt;
}

Result<std::string> WebDavRemote::displace(Session& session, const std::string& path,
                                           const RemoteEntry& expected, CancelFlag& cancel) {
    const WebDavTrash::Taken taken = session.trash.take(path, false, cancel);
    const bool open = !taken.result.isMade();
    if (open && (!taken.result.isOpen() || !isSurelyGone(find(session, path, cancel))))
        return refusal(session, taken.result, "MOVE", path, cancel);
    if (isSame(session, taken.place, expected, cancel))
        return taken.place;
    if (Failure lost = putBack(session, taken.place, path, false, cancel))
        return *lost;
    return makeError(ErrorCode::changedRemotely, nameOf(path));
}

/// A server deletes folders with all that is in them. So it is looked for what is in it before, and
/// once more when nobody can put anything into it any longer.
Failure WebDavRemote::removeFolder(Session& session, const std::string& path, CancelFlag& cancel) {
    const auto isEmpty = [&](const std::string& place, bool& empty) -> Failure {
        const Result<RemoteListing> listing = list(place, cancel);
        if (!listing)
            return listing.error();
        empty = listing->entries.empty() && listing->refused.empty();
        return std::nullopt;
    };
    bool empty = false;
    if (Failure failure = isEmpty(path, empty))
        return failure;
    if (!empty)
        return makeError(ErrorCode::folderNotEmpty, nameOf(path));
    const WebDavTrash::Taken taken = session.trash.take(path, true, cancel);
    const bool open = !taken.result.isMade();
    if (open && (!taken.result.isOpen() || !isSurelyGone(find(session, path, cancel))))
        return refusal(session, taken.result, "MOVE", path, cancel);
    const Failure unread = isEmpty(taken.place, empty);
    if (!unread && empty)
        return std::nullopt;
    if (Failure lost = putBack(session, taken.place, path, true, cancel))
        return lost;
    return unread ? unread : makeError(ErrorCode::folderNotEmpty, nameOf(path));
}

Failure WebDavRemote::putBack(Session& session, const std::string& from, const std::string& path,
                              bool isFolder, CancelFlag& cancel) {
    HttpResult moved = session.server.move(from, path, isFolder, cancel);
    const ItemKind kind = isFolder ? ItemKind::folder : ItemKind::file;
    const std::string folder(folderOf(path) == "." ? std::string_view() : folderOf(path));
    for (int number = 1; moved.ok() && moved.reply.status == 412 && number <= namesBeside;
         ++number) {
        const std::string name =
            conflictName(nameOf(path), kind, session.server.now(), deviceName(), number);
        moved = session.server.move(from, folder.empty() ? name : folder + '/' + name, isFolder,
                                    cancel);
    }
    if (moved.isMade() || isSurelyGone(find(session, from, cancel)))
        return std::nullopt;
    platformLog(LogLevel::error, "cloud: what was displaced from “%@” lies at “%@” on the server",
                path, from);
    return makeErrorWithText(
        ErrorCode::serverRefused,
        localizedFormat("“%1$@” was changed while it was being replaced. What was there lies at "
                        "“%2$@” on the server.",
                        nameOf(path), from));
}

} // namespace platform
