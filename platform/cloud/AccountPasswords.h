#pragma once

#include "platform/cloud/webdav/WebDavAccount.h"
#include "platform/system/SecretStore.h"

#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <optional>
#include <string>

namespace platform {

/// Answers the passwords that remotes ask for, from where they are kept. One that a server has
/// refused is not sent to it again: from then on a person is wanted, who gives another one. Safe
/// from any thread; credentials() may block.
class AccountPasswords {
public:
    /// `changed` is called, on any thread, when whyWanted() may answer something else.
    AccountPasswords(std::shared_ptr<SecretStore> secrets, std::function<void()> changed)
        : secrets_(std::move(secrets)), changed_(std::move(changed)) {}

    /// As AccountCredentials.
    std::optional<WebDavCredentials> credentials(const AccountRecord& account, bool refused);

    /// Why nothing goes on with the account before somebody has given its password, in the user's
    /// language; none while that is not so.
    std::optional<std::string> whyWanted(const AccountRecord& account) const;

    /// The user wants it tried again: also a password that was refused, once.
    void tryAgain();

    SecretStore& secrets() { return *secrets_; }

private:
    struct Known {
        std::string given;
        bool refused = false;
        std::optional<std::string> wanted = {};
    };
    void note(const std::string& name, Known known);

    const std::shared_ptr<SecretStore> secrets_;
    const std::function<void()> changed_;
    mutable std::mutex mutex_;
    std::map<std::string, Known> known_; // by secretNameOf(); guarded by mutex_
};

} // namespace platform
