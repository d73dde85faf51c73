#pragma once

#include "platform/base/Clock.h"
#include "platform/documents/preview/PreviewWorker.h"
#include "platform/system/ProgramStart.h"

#include <functional>
#include <string_view>

namespace platform {

/// How a child process came to its end.
enum class ChildEnd {
    /// With exit status 0.
    done,
    failed,
    outOfTime,
    cancelled,
    /// It could not be started.
    absent,
};

/// Takes the next bytes that the child has written; answers false when it wants no more, which
/// ends the child as a failure.
using ChildOutput = std::function<bool(std::string_view bytes)>;

/// Runs a program that does a part of a preview's work in a process group of its own, so that what
/// it crashes on or eats up is its own as well. Waits for its end; a cancelled token, or `limit`
/// gone by, kills the whole group. Not on the main thread.
ChildEnd runChild(ProgramStart start, PreviewToken& token, Clock& clock, Duration limit,
                  const ChildOutput& output);

} // namespace platform
