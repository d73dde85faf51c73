#pragma once

#include "platform/base/Clock.h"
#include "platform/base/Folders.h"
#include "platform/base/MainQueue.h"
#include "platform/base/NotificationCenter.h"

namespace platform {

/// The part of the installed platform that the lowest floor needs: time, the main queue, notices
/// and folders. There is one at a time; platform/Platform.h puts it in place with everything else.
struct Runtime {
    Clock& clock;
    MainQueue& mainQueue;
    NotificationCenter& notifications;
    Folders folders;

    /// The installed one. Calling this before there is one ends the process: a programming fault.
    static Runtime& current();
    static bool installed();
    /// Puts `runtime` in place (none takes it away). It must stay alive until it is taken away.
    static void install(Runtime* runtime);
};

} // namespace platform
