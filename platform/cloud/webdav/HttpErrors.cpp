#include "platform/cloud/webdav/HttpErrors.h"

#include "platform/base/Text.h"

#include <curl/curl.h>

namespace platform {
namespace {

HttpResult troubledResult(HttpTrouble trouble, ErrorCode code, std::string words,
                    std::string reason = {}) {
    Error error = makeErrorWithText(code, std::move(words));
    if (!reason.empty())
        error.localizedFailureReason = std::move(reason);
    return {trouble, std::move(error), {}};
}

/// Host and port, for people.
std::string serverIn(const std::string& url) {
    const std::size_t begin = url.find("://") + 3;
    return url.substr(begin, url.find('/', begin) - begin);
}

std::string statusText(const HttpReply& reply) {
    return "HTTP " + std::to_string(reply.status);
}

Error refusedByServer(const HttpReply& reply, ErrorCode code, std::string words) {
    Error error = makeErrorWithText(code, std::move(words));
    error.localizedFailureReason = statusText(reply);
    return error;
}

bool isChange(std::string_view method) {
    return method != "GET" && method != "HEAD" && method != "PROPFIND";
}

} // namespace

HttpResult brokenResult(int code, const std::string& detail, const std::string& url) {
    const std::string server = serverIn(url);
    switch (code) {
    case CURLE_COULDNT_RESOLVE_HOST:
    case CURLE_COULDNT_RESOLVE_PROXY:
    case CURLE_COULDNT_CONNECT:
        return troubledResult(HttpTrouble::unreachable, ErrorCode::serverNotAvailable,
                        localizedFormat("The server “%1$@” cannot be reached. Check the network "
                                        "and the address.",
                                        server),
                        detail);
    case CURLE_PEER_FAILED_VERIFICATION:
    case CURLE_SSL_CONNECT_ERROR:
    case CURLE_SSL_CACERT_BADFILE:
    case CURLE_SSL_ISSUER_ERROR:
    case CURLE_SSL_INVALIDCERTSTATUS:
    case CURLE_USE_SSL_FAILED:
        return troubledResult(HttpTrouble::certificate, ErrorCode::serverNotAvailable,
                        localizedFormat("The server “%1$@” cannot prove who it is: its certificate "
                                        "is not valid or not known here. Nothing was sent to it.",
                                        server),
                        detail);
    case CURLE_OPERATION_TIMEDOUT:
        return troubledResult(HttpTrouble::stalled, ErrorCode::timedOut,
                              localizedFormat("The server “%1$@” does not answer any more. It is "
                                              "tried again.",
                                              server),
                              detail);
    default:
        return troubledResult(HttpTrouble::broken, ErrorCode::timedOut,
                        localizedFormat("The connection to the server “%1$@” broke off. It is "
                                        "tried again.",
                                        server),
                        detail);
    }
}

HttpResult passwordResult() {
    return troubledResult(HttpTrouble::password, ErrorCode::authenticationFailed,
                    localized("The server does not accept the user or the password. Sign in "
                              "again."));
}

HttpResult elsewhereResult(const std::string& where) {
    return troubledResult(HttpTrouble::elsewhere, ErrorCode::serverRefused,
                    localizedFormat("The server sends on to “%1$@”, which is not followed. Sign in "
                                    "with that address if it is the right one.",
                                    where));
}

HttpResult waitResult(std::int64_t seconds) {
    return troubledResult(HttpTrouble::wait, ErrorCode::serverNotAvailable,
                    localizedFormat("The server is busy and asks to be left alone for %1$@ "
                                    "seconds. Everything waits until then.",
                                    seconds));
}

Error errorOfStatus(const HttpReply& reply, std::string_view method, std::string_view name) {
    const bool change = isChange(method);
    switch (reply.status) {
    case 403:
        if (change)
            return refusedByServer(
                reply, ErrorCode::writeNoPermission,
                localizedFormat("The server does not allow “%1$@” to be changed.", name));
        return refusedByServer(
            reply, ErrorCode::readNoPermission,
            localizedFormat("The server does not allow “%1$@” to be read.", name));
    case 404:
    case 410:
        return makeError(ErrorCode::noSuchItem, name);
    case 405:
        if (method == "MKCOL")
            return makeError(ErrorCode::fileExists, name);
        break;
    case 409: // the folder above is not there
        return change ? makeError(ErrorCode::noSuchItem, name)
                      : makeErrorWithText(ErrorCode::serverRefused, statusText(reply));
    case 412:
        return makeError(ErrorCode::changedRemotely, name);
    case 413:
        return refusedByServer(reply, ErrorCode::serverRefused,
                       localizedFormat("The server takes no file as large as “%1$@”.", name));
    case 414:
        return makeError(ErrorCode::nameRefused, name);
    case 423:
        return refusedByServer(reply, ErrorCode::serverRefused,
                       localizedFormat("“%1$@” is locked on the server by another program. It is "
                                       "tried again.",
                                       name));
    case 507:
        return makeError(ErrorCode::quotaExceeded, name);
    case 502:
    case 504:
        return refusedByServer(reply, ErrorCode::timedOut,
                       localized("The server does not reach what stands behind it. It is tried "
                                 "again."));
    default:
        break;
    }
    return refusedByServer(reply, ErrorCode::serverRefused,
                   localizedFormat("The server refused a request for “%1$@” (%2$@). It is tried "
                                   "again.",
                                   name, statusText(reply)));
}

} // namespace platform
