#pragma once

#include "platform/cloud/AccountFile.h"

#include <vector>

// All accounts that are signed in to on this device. One of them is the active one, whose documents
// are shown: account.json names it. The others wait in accounts.json beside it, which holds them
// all. Changes are meant for one program at a time; each leaves both files whole.

namespace platform {

/// In the order of their signing in; the active one among them. What cannot be read is left out
/// (and stays in the file).
std::vector<AccountRecord> storedAccounts(const Folders& folders);
/// By its name for people or its address; none when there is no such account, or more than one.
std::optional<AccountRecord> accountNamed(const Folders& folders, std::string_view name);

/// Adds the account, in place of the one of the same kind, address and user, and makes it the
/// active one. A name that another one has gets a number.
[[nodiscard]] Failure rememberAccount(const Folders& folders, AccountRecord account);
/// The stored one at the same place, which rememberAccount would replace.
std::optional<AccountRecord> storedAccountLike(const Folders& folders,
                                               const AccountRecord& account);
/// Makes a stored account the active one. noAccount when it is not there.
[[nodiscard]] Failure useAccount(const Folders& folders, const Bytes& identity);
/// Takes the account out of both files; nothing of its store. When it was the active one, none is.
[[nodiscard]] Failure forgetAccount(const Folders& folders, const Bytes& identity);

/// What a password is kept under.
std::string secretNameOf(const AccountRecord& account);
/// What a keyring shows of it.
std::string secretLabelOf(const AccountRecord& account);
std::string accountsFile(const Folders& folders);

} // namespace platform
