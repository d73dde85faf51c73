#pragma once

#include "platform/base/Value.h"

#include <optional>
#include <string>
#include <string_view>

namespace platform {

/// Posted on the main thread when the signed-in account changed, appeared or went away.
inline constexpr std::string_view cloudIdentityDidChangeNotification =
    "CloudIdentityDidChangeNotification";

/// Posted on the main thread when CloudAccountService::problem may answer something else.
inline constexpr std::string_view cloudProblemDidChangeNotification =
    "CloudProblemDidChangeNotification";

/// Posted on the main thread when a transfer has begun or ended; many at once are told once.
inline constexpr std::string_view cloudActivityDidChangeNotification =
    "CloudActivityDidChangeNotification";

/// Who is signed in: opaque, comparable, and storable as bytes.
class IdentityToken {
public:
    explicit IdentityToken(Bytes bytes) : bytes_(std::move(bytes)) {}
    const Bytes& serialized() const { return bytes_; }
    static std::optional<IdentityToken> deserialized(const Bytes& bytes);
    bool operator==(const IdentityToken&) const = default;

private:
    Bytes bytes_;
};

/// What of the account a person may read in the window.
struct AccountSummary {
    std::string name;
    /// "folder" or "webdav".
    std::string kind;
    std::string address;
};

/// The cloud account of the user. Main thread, except where told.
class CloudAccountService {
public:
    virtual ~CloudAccountService() = default;
    /// The current account's token; none when nobody is signed in. Safe from any thread.
    virtual std::optional<IdentityToken> identityToken() const = 0;
    virtual std::optional<AccountSummary> account() const = 0;
    /// What is wrong, and what to do about it, in the user's language: nobody is signed in, a
    /// damaged account file, an unknown kind, a store that another program has; also a remote that
    /// is away, with which an account stays usable. None when all is well. Safe from any thread.
    virtual std::optional<std::string> problem() const = 0;
};

} // namespace platform
