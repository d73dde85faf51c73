#pragma once

#include "platform/cloud/AccountFile.h"
#include "platform/cloud/webdav/WebDavRemote.h"

#include <functional>
#include <optional>
#include <string>

namespace platform {

/// Answers the credentials of an account, as CredentialSource does; see HttpClient.h.
using AccountCredentials =
    std::function<std::optional<WebDavCredentials>(const AccountRecord& account, bool refused)>;

/// Of an account of the kind webdav. Empty when its address is none.
std::unique_ptr<WebDavRemote> makeWebDavRemote(const AccountRecord& account,
                                               AccountCredentials credentials, Clock& clock);

/// Why somebody cannot be signed in at an address.
enum class WebDavProblem {
    none,
    address,     // not well-formed
    unreachable, // no server there, or no network
    certificate,
    password,
    notFound,
    notWebDav,
    other
};

struct WebDavAnswer {
    WebDavProblem problem = WebDavProblem::none;
    /// In the user's language, naming cause and remedy; none when there is no problem.
    Failure failure = {};
    /// Of the account's folder, after what the server sent on to.
    std::string address = {};
    /// What goes to and fro can be read by nobody on the way.
    bool encrypted = false;
    WebDavCapabilities capabilities = {};
};

/// Looks whether an account can be at that address, and tries out what its server can do: makes the
/// hidden service folder there. Blocks; not on the main thread.
WebDavAnswer probeWebDav(const std::string& address, const WebDavCredentials& credentials,
                         const std::string& authorities, Clock& clock, CancelFlag& cancel);

} // namespace platform
