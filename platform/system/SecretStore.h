#pragma once

#include "platform/base/Folders.h"
#include "platform/base/Result.h"

#include <memory>
#include <optional>
#include <string>

namespace platform {

enum class SecretPlace {
    /// The desk's keyring (Secret Service): encrypted, opened with the user's session.
    keyring,
    /// A file that the user alone may read. It is not encrypted: ask before it is used.
    file
};

/// Keeps the passwords of accounts. Nothing of a secret is ever logged or put into an error. Calls
/// block, for as long as a person takes to open a locked keyring: not on the main thread, safe from
/// any other.
class SecretStore {
public:
    virtual ~SecretStore() = default;

    /// There is a keyring, or one that starts when it is asked.
    virtual bool hasKeyring() = 0;
    /// The user has wanted this account's in the file.
    virtual bool isInFile(const std::string& account) = 0;
    /// None when nothing is kept for the account. An error says that the place where it may be
    /// cannot be read, and what to do.
    virtual Result<std::optional<std::string>> lookUp(const std::string& account) = 0;
    /// Puts it there and takes it from the other place. `label` is what the keyring shows of it.
    /// After an error, what was kept before is as it was.
    [[nodiscard]] virtual Failure store(const std::string& account, const std::string& label,
                                        const std::string& secret, SecretPlace place) = 0;
    /// From wherever it is. Success when there is none.
    [[nodiscard]] virtual Failure remove(const std::string& account) = 0;
};

std::unique_ptr<SecretStore> makeSecretStore(const Folders& folders);
/// Where SecretPlace::file is.
std::string secretFile(const Folders& folders);

} // namespace platform
