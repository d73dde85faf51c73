#pragma once

#include <optional>
#include <string>

namespace platform {

class PeerProcess;

/// The programs whose requests bear a name.
struct KnownCallers {
    /// The installed opener, which stands for the home screen; "" for none.
    std::string opener;
    /// The runner of tests; "" for none.
    std::string testRunner;

    /// "tavrin-open" and "tavrin-test-runner" beside this program; an installation has only the
    /// first. Whoever could put the second there could as well have put another program in place
    /// of this one.
    static KnownCallers besideThisProgram();
};

/// This program's own file; "" when the system does not say.
std::string executablePath();

/// Who a process is: the identifier of a known caller, else the path of its executable; none when
/// it has ended, or its executable cannot be read. A known caller's file counts only where nobody
/// may write it who may not write this program's own.
std::optional<std::string> identityOf(const PeerProcess& process, const KnownCallers& callers);

} // namespace platform
