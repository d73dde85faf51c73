#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/cloud/RemoteNames.h"
#include "platform/cloud/Tokens.h"
#include "platform/cloud/webdav/HttpErrors.h"
#include "platform/cloud/webdav/WebDavRemote.h"
#include "platform/files/PathText.h"

namespace platform {
namespace {

constexpr std::size_t largestMarkFile = 256;
/// In bytes; what every server takes whose disk takes 255, with the ends of its own beside it.
constexpr std::size_t longestSureName = 240;

std::string hiddenFile(std::string_view name) {
    return std::string(remoteServiceFolder) + '/' + std::string(name);
}

/// Of errors that end a connection: whatever they are, nothing is known of the remote.
Error asAway(Error error) {
    if (error.is(ErrorCode::userCancelled) || error.is(ErrorCode::authenticationFailed))
        return error;
    error.code = static_cast<int>(ErrorCode::serverNotAvailable);
    return error;
}

Error notThere(const HttpReply& reply, const std::string& address) {
    std::string words;
    if (reply.status == 404 || reply.status == 410)
        words = localizedFormat("There is nothing at “%1$@” on the server. Check the address.",
                                address);
    else if (reply.status == 403)
        words = localizedFormat("The server does not allow the folder “%1$@” to be read.", address);
    else if (reply.status >= 500)
        words = localizedFormat("The server has a fault of its own and does not answer for “%1$@”. "
                                "It is tried again.",
                                address);
    else
        words = localizedFormat(
            "The server answers for “%1$@”, and not as a WebDAV server does. Check the address: it "
            "is that of a folder, and often longer than that of the site.",
            address);
    Error error = makeErrorWithText(ErrorCode::serverNotAvailable, std::move(words));
    error.localizedFailureReason = "HTTP " + std::to_string(reply.status);
    return error;
}

} // namespace

WebDavRemote::WebDavRemote(WebDavAddress address, HttpOptions options, Clock& clock)
    : address_(std::move(address)), options_(std::move(options)), clock_(clock) {
}

WebDavRemote::~WebDavRemote() = default;

WebDavRemote::Held WebDavRemote::session() const {
    const std::lock_guard lock(mutex_);
    return session_;
}

std::optional<WebDavCapabilities> WebDavRemote::capabilities() const {
    const Held held = session();
    return held ? std::optional(held->can) : std::nullopt;
}

WebDavAddress WebDavRemote::address() const {
    const Held held = session();
    return held ? held->server.address() : address_;
}

Error WebDavRemote::away() const {
    return makeErrorWithText(
        ErrorCode::serverNotAvailable,
        localizedFormat("What is at “%1$@” now is not what this account was linked with. Nothing "
                        "is changed until it is back.",
                        address().text()));
}

Result<WebDavRemote::Held> WebDavRemote::open(CancelFlag& cancel) {
    if (cancel.isCancelled())
        return makeError(ErrorCode::userCancelled);
    Held held = session();
    if (!held)
        return makeError(ErrorCode::serverNotAvailable);
    return held;
}

Result<DavItem> WebDavRemote::findRoot(Session& session, std::string& url, CancelFlag& cancel) {
    std::optional<DavItem> root;
    const HttpResult result = session.server.properties(
        "", true, 0,
        [&](DavItem item) -> Failure {
            if (!root)
                root = std::move(item);
            return std::nullopt;
        },
        cancel);
    const std::string address = session.server.address().text();
    if (result.trouble == HttpTrouble::caller && result.reply.status == 207)
        return notThere(result.reply, address);
    if (!result.ok())
        return asAway(*result.failure);
    if (result.reply.status != 207 || !root || !root->isCollection)
        return notThere(result.reply, address);
    url = result.reply.url;
    return std::move(*root);
}

Result<std::string> WebDavRemote::connect(CancelFlag& cancel) {
    const std::lock_guard one(connecting_);
    Held held = session();
    // One that took no changes is tried once more: it may have had a bad moment.
    const bool fresh = !held || !held->can.takesChanges();
    if (fresh)
        held = std::make_shared<Session>(address_, options_, clock_);
    std::string url;
    Result<DavItem> root = findRoot(*held, url, cancel);
    if (!root)
        return root.error();
    if (fresh && url != held->server.address().text()) {
        const Result<WebDavAddress> moved = WebDavAddress::parse(url);
        if (!moved)
            return moved.error();
        held = std::make_shared<Session>(*moved, options_, clock_);
        root = findRoot(*held, url, cancel);
        if (!root)
            return root.error();
    }
    const std::optional<std::string> path = pathOfHref(root->href);
    if (!path)
        return notThere({207, {}, {}}, url);
    if (fresh) {
        held->root = *path;
        Result<std::string> mark = makeMark(*held, cancel);
        if (!mark)
            return asAway(mark.error());
        Result<WebDavCapabilities> can = WebDavProbe(held->server, cancel).run(*root);
        if (!can)
            return asAway(can.error());
        held->can = std::move(*can);
        if (held->can.writable)
            held->trash.expire(cancel);
    }
    // Also after the first one has made it: another device may have been faster.
    Result<std::string> mark = readMark(*held, cancel);
    if (!mark)
        return asAway(mark.error());
    if (fresh) {
        held->marked = !mark->empty();
        const std::lock_guard lock(mutex_);
        session_ = held;
    } else if (mark->empty() && held->marked) {
        return away();
    }
    return mark->empty() ? "unmarked " + held->root : std::move(*mark);
}

/// "" where there is none.
Result<std::string> WebDavRemote::readMark(Session& session, CancelFlag& cancel) {
    std::string mark;
    const std::string file = hiddenFile("root");
    const HttpResult result = session.server.read(file, largestMarkFile, mark, cancel);
    if (!result.ok())
        return *result.failure;
    if (result.reply.status == 404 || result.reply.status == 409)
        return std::string();
    if (!result.reply.isGood())
        return errorOfStatus(result.reply, "GET", file);
    return mark;
}

/// "" on a server that takes no changes.
Result<std::string> WebDavRemote::makeMark(Session& session, CancelFlag& cancel) {
    Result<std::string> mark = readMark(session, cancel);
    if (!mark || !mark->empty())
        return mark;
    const HttpResult folder =
        session.server.makeFolder(std::string(remoteServiceFolder), cancel);
    if (!folder.ok())
        return *folder.failure;
    const std::string place = hiddenFile("root-" + hexText(randomBytes(6)));
    const HttpResult put = session.server.put(place, hexText(randomBytes(16)), {}, cancel);
    if (!put.ok())
        return *put.failure;
    if (!put.reply.isGood())
        return std::string();
    const HttpResult moved = session.server.move(place, hiddenFile("root"), false, cancel);
    if (!moved.ok())
        return *moved.failure;
    if (!moved.reply.isGood())
        session.server.erase(place, false, cancel);
    return readMark(session, cancel);
}

Failure WebDavRemote::checkThere(Session& session, CancelFlag& cancel) {
    const std::string_view folder = session.marked ? remoteServiceFolder : std::string_view();
    const HttpResult result = session.server.properties(
        folder, true, 0, [](const DavItem&) { return Failure(); }, cancel);
    if (!result.ok())
        return asAway(*result.failure);
    return result.reply.status == 207 ? Failure() : Failure(away());
}

Error WebDavRemote::errorOf(Session& session, const HttpResult& result, std::string_view method,
                            std::string_view path, CancelFlag& cancel) {
    if (result.ok()) {
        Error error = errorOfStatus(result.reply, method, nameOf(path));
        if (error.is(ErrorCode::noSuchItem))
            return checkThere(session, cancel).value_or(error);
        return error;
    }
    // One item that breaks the connection each time must not keep the others waiting.
    if (result.isOpen())
        return checkThere(session, cancel).value_or(*result.failure);
    return *result.failure;
}

Error WebDavRemote::refusal(Session& session, const HttpResult& result, std::string_view method,
                            std::string_view path, CancelFlag& cancel) {
    Error error = errorOf(session, result, method, path, cancel);
    // Servers say "not found", "conflict" or "fault" of a name that is too long for their disk.
    if (result.ok() && nameOf(path).size() > longestSureName &&
        !error.is(ErrorCode::serverNotAvailable) && !error.is(ErrorCode::quotaExceeded) &&
        result.reply.status != 423)
        return nameRefusedError(nameOf(path), localized("The name is too long for the server."));
    return error;
}

} // namespace platform
