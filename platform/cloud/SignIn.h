#pragma once

#include "platform/base/Clock.h"
#include "platform/cloud/AccountFile.h"
#include "platform/files/ContentProvider.h"
#include "platform/system/SecretStore.h"

#include <cstdint>
#include <optional>
#include <string>

// Signing in, in two steps: the place is looked at, and then, when there are no questions left, the
// account is written down. All of it blocks: not on the main thread.

namespace platform {

/// What somebody gives who wants to sign in.
struct SignInRequest {
    /// folderAccountKind or webDavAccountKind.
    std::string kind;
    /// A path, or the address of a folder on a server; "https://" may be left out.
    std::string address;
    /// For people; "" for one that is made of the rest.
    std::string name = {};
    std::string user = {};
    std::string password = {};
    /// A file of certificate authorities; "" for the system's alone.
    std::string authorities = {};
    std::optional<std::uint64_t> rateLimit = {};
    std::optional<std::uint64_t> quota = {};
};

enum class SignInProblem {
    none,
    address,
    unreachable,
    certificate,
    password,
    notFound,
    notWebDav,
    other,
    cancelled
};

struct SignInAnswer {
    SignInProblem problem = SignInProblem::none;
    /// In the user's language, naming cause and remedy; none when there is no problem.
    Failure failure = {};
    /// Ready to be written down, with an identity of its own.
    AccountRecord account = {};
    /// What a server cannot do that would make the account better; none when all is well.
    std::optional<std::string> remark = {};
};

/// Whether a password would go to that address in clear text, for all on the way to read: ask
/// before anything is sent.
bool sendsInTheClear(const SignInRequest& request);

/// Looks whether an account can be there; a server is asked with user and password.
SignInAnswer checkSignIn(const SignInRequest& request, const Folders& folders, Clock& clock,
                         CancelFlag& cancel);

/// Keeps the password (of a server) there, and makes the account the active one. After an error
/// nothing has changed.
[[nodiscard]] Failure finishSignIn(const AccountRecord& account, const std::string& password,
                                   SecretPlace place, SecretStore& secrets, const Folders& folders);

/// Forgets the account and its password; its store stays. When only the password could not be
/// forgotten, the account is, and the error says so.
[[nodiscard]] Failure signOutOf(const AccountRecord& account, SecretStore& secrets,
                                const Folders& folders);

/// "user@host", or a folder's name.
std::string nameForPeople(const AccountRecord& account);

} // namespace platform
