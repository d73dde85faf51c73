#pragma once

#include "platform/base/Folders.h"
#include "platform/base/Result.h"
#include "platform/base/Value.h"

#include <cstdint>
#include <optional>
#include <string>

namespace platform {

inline constexpr std::string_view folderAccountKind = "folder";
inline constexpr std::string_view webDavAccountKind = "webdav";

/// What account.json says: who is signed in, and where the remote is. There is no password in it.
struct AccountRecord {
    std::string kind;
    /// An absolute path, or a URL, as the kind wants it.
    std::string address;
    /// For people.
    std::string name;
    /// Random, made at sign-in.
    Bytes identity;
    /// Bytes a second that transfers may take; none for no limit.
    std::optional<std::uint64_t> rateLimit;
    /// Size of the account in bytes where the remote itself has no limit.
    std::optional<std::uint64_t> quota;
    /// Who signs in to a server; "" where nobody has to.
    std::string user = {};
    /// A file of certificate authorities that are trusted beside the system's; "" for none.
    std::string authorities = {};
    bool operator==(const AccountRecord&) const = default;
};

/// The account, or why there is none: in the user's language, naming cause and remedy.
struct AccountReading {
    std::optional<AccountRecord> account;
    std::optional<std::string> problem;
    /// There is no account file at all: nobody has signed in.
    bool missing = false;
    bool operator==(const AccountReading&) const = default;
};

/// "…/pelmora", which holds the account file, and the file.
std::string accountFolder(const Folders& folders);
std::string accountFile(const Folders& folders);

AccountReading readAccount(const Folders& folders);
/// The problem of a missing file.
std::string nobodySignedInText();
/// The same of a text that `file` holds.
AccountReading accountOfText(std::string_view text, const std::string& file);
std::string textOfAccount(const AccountRecord& account);
/// The whole file at once, readable by the user alone.
[[nodiscard]] Failure writeAccount(const Folders& folders, const AccountRecord& account);
/// Success when there is none.
[[nodiscard]] Failure removeAccount(const Folders& folders);

/// The name of the account's folder below $XDG_DATA_HOME/pelmora: made of kind and address, so that
/// signing in to the same place again finds the same store. Safe as a file name.
std::string storeFolderName(const AccountRecord& account);

} // namespace platform
