#pragma once

#include "platform/base/Result.h"
#include "platform/base/Url.h"
#include "platform/launch/DesktopEntry.h"
#include "platform/launch/ExecLine.h"

#include <functional>
#include <optional>
#include <string>
#include <vector>

namespace platform {

/// Starts other programs, which live on when this one ends. Main thread, with the event loop
/// running. An error says why nothing was started; `endedAtOnce` is called later when the program
/// was started but failed within its first seconds.
class ApplicationStart {
public:
    using EndedAtOnce = std::function<void(const Error& error)>;

    /// The application with the document (a file, or an address of a scheme that it handles).
    static Failure open(const DesktopEntry& entry, const std::optional<ExecTarget>& document,
                        EndedAtOnce endedAtOnce);
    /// A program by its arguments; `name` is what the user knows it by.
    static Failure run(std::vector<std::string> arguments, const std::string& name,
                       const std::string& folder, EndedAtOnce endedAtOnce);
};

} // namespace platform
