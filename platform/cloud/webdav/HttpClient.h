#pragma once

#include "platform/base/Clock.h"
#include "platform/cloud/webdav/HttpMessage.h"
#include "platform/files/ContentProvider.h"

#include <functional>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <vector>

namespace platform {

struct HttpExchange;

struct WebDavCredentials {
    std::string user;
    std::string password;
    bool operator==(const WebDavCredentials&) const = default;
};

/// Answers user and password; none when there are none. `refused` says that the ones given last
/// were, so that whoever keeps them looks again (or asks). Called on any thread, one call at a
/// time; may block.
using CredentialSource = std::function<std::optional<WebDavCredentials>(bool refused)>;

struct HttpOptions {
    CredentialSource credentials;
    /// A file of further certificate authorities (PEM) that are trusted; "" for the system's alone.
    std::string authorities;
    /// A connection on which so long not a byte moves is given up.
    Duration stall = std::chrono::seconds(60);
};

/// Speaks HTTP to one server. Each request runs on the calling thread over a connection that is
/// borrowed for its time and kept for later ones; bodies are handed over in pieces, so that memory
/// is bounded and a slow caller slows the server. Safe from any thread.
///
/// Certificates are always verified. Credentials go to the origin of the request alone: an answer
/// that sends elsewhere is followed within the same origin, and only by requests that change
/// nothing. Nothing of them, and no header, is logged.
class HttpClient {
public:
    HttpClient(HttpOptions options, Clock& clock);
    ~HttpClient();
    HttpClient(const HttpClient&) = delete;
    HttpClient& operator=(const HttpClient&) = delete;

    /// Blocks. A refused password is asked for once more. While a server wants to be left alone
    /// (429, 503 with Retry-After), requests fail at once.
    HttpResult perform(const HttpRequest& request, CancelFlag& cancel);

    /// Lets time pass for the server, whose clock no clock of ours moves. False when cancelled.
    bool pause(CancelFlag& cancel);

    /// What the server's clock shows now; the machine's as long as the server has not told.
    Date serverNow() const;

private:
    struct Lane;
    std::unique_ptr<Lane> borrow();
    void giveBack(std::unique_ptr<Lane> lane);
    /// `who` becomes those that were sent along.
    HttpResult once(const HttpRequest& request, std::optional<WebDavCredentials>& who,
                    CancelFlag& cancel);
    void prepare(Lane& lane, HttpExchange& exchange);
    std::optional<WebDavCredentials> credentials();
    /// After a 401 for those; false when there are no others.
    bool renewCredentials(const std::optional<WebDavCredentials>& refused);
    std::optional<HttpResult> mustWait();
    void noteWait(const HttpReply& reply);
    void noteReply(const HttpReply& reply);

    HttpOptions options_;
    Clock& clock_;
    mutable std::mutex mutex_;
    std::vector<std::unique_ptr<Lane>> idle_; // guarded by mutex_, as are the next five
    Duration notBefore_{0};
    std::optional<Duration> serverOffset_; // of the server's wall clock from our monotonic one
    unsigned long schemes_ = 0;            // of authentication; 0 until the server has told
    std::mutex asking_;                    // one question for credentials at a time
    std::optional<WebDavCredentials> credentials_; // guarded by asking_, as is the next
    bool asked_ = false;
};

} // namespace platform
