#include "platform/cloud/webdav/WebDavAccount.h"

#include "platform/base/Log.h"

namespace platform {
namespace {

WebDavProblem signInProblemOf(const HttpResult& result, bool isFolder) {
    switch (result.trouble) {
    case HttpTrouble::none:
        if (result.reply.status == 404 || result.reply.status == 410)
            return WebDavProblem::notFound;
        if (result.reply.status == 207)
            return isFolder ? WebDavProblem::none : WebDavProblem::notWebDav;
        return result.reply.status == 403 || result.reply.status >= 500 ? WebDavProblem::other
                                                                        : WebDavProblem::notWebDav;
    case HttpTrouble::caller: // the answer was not readable
        return result.reply.status == 207 ? WebDavProblem::notWebDav : WebDavProblem::other;
    case HttpTrouble::certificate:
        return WebDavProblem::certificate;
    case HttpTrouble::password:
        return WebDavProblem::password;
    case HttpTrouble::unreachable:
    case HttpTrouble::broken:
    case HttpTrouble::stalled:
        return WebDavProblem::unreachable;
    case HttpTrouble::wait:
    case HttpTrouble::elsewhere:
        break;
    }
    return WebDavProblem::other;
}

} // namespace

std::unique_ptr<WebDavRemote> makeWebDavRemote(const AccountRecord& account,
                                               AccountCredentials credentials, Clock& clock) {
    const Result<WebDavAddress> address = WebDavAddress::parse(account.address);
    if (!address) {
        platformLog(LogLevel::error, "cloud: the account's address is not one of a server: %@",
                    address.error());
        return nullptr;
    }
    HttpOptions options;
    options.authorities = account.authorities;
    if (credentials)
        options.credentials = [account, credentials = std::move(credentials)](bool refused) {
            return credentials(account, refused);
        };
    return std::make_unique<WebDavRemote>(*address, std::move(options), clock);
}

WebDavAnswer probeWebDav(const std::string& address, const WebDavCredentials& credentials,
                         const std::string& authorities, Clock& clock, CancelFlag& cancel) {
    const Result<WebDavAddress> parsed = WebDavAddress::parse(address);
    if (!parsed)
        return {WebDavProblem::address, parsed.error()};
    // A refused password is not tried twice: some servers count.
    HttpOptions options{[credentials](bool refused) {
                            return refused ? std::nullopt : std::optional(credentials);
                        },
                        authorities};
    WebDavRemote remote(*parsed, options, clock);
    const Result<std::string> mark = remote.connect(cancel);
    WebDavAnswer answer;
    answer.address = remote.address().text();
    answer.encrypted = remote.address().isEncrypted();
    if (mark) {
        answer.capabilities = remote.capabilities().value_or(WebDavCapabilities{});
        return answer;
    }
    answer.failure = mark.error();
    answer.problem = WebDavProblem::password;
    if (mark.error().is(ErrorCode::authenticationFailed))
        return answer;
    bool isFolder = false;
    DavServer server(*parsed, options, clock);
    answer.problem = signInProblemOf(server.properties(
                                   "", true, 0,
                                   [&](const DavItem& item) {
                                       isFolder = isFolder || item.isCollection;
                                       return Failure();
                                   },
                                   cancel),
                               isFolder);
    if (answer.problem == WebDavProblem::none)
        answer.problem = WebDavProblem::other;
    return answer;
}

} // namespace platform
