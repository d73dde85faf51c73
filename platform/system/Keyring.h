#pragma once

#include "platform/base/Clock.h"
#include "platform/base/Result.h"

#include <optional>
#include <string>

// The keyring of the desk (Secret Service on the session bus), behind a library that is loaded when
// it is first needed: a machine without it, or an account without a password, does without.

namespace platform {

/// How long a person may take to open a locked keyring. One that hangs is given up by then, too.
inline constexpr Duration keyringPatience = std::chrono::seconds(90);

/// Somebody answers for the Secret Service on the session bus, or starts when called.
bool keyringIsThere();
/// The three block for `patience` at most; timedOut says so in words.
Result<std::optional<std::string>> lookUpInKeyring(const std::string& account,
                                                   Duration patience = keyringPatience);
[[nodiscard]] Failure storeInKeyring(const std::string& account, const std::string& label,
                                     const std::string& secret,
                                     Duration patience = keyringPatience);
[[nodiscard]] Failure removeFromKeyring(const std::string& account,
                                        Duration patience = keyringPatience);

} // namespace platform
