#pragma once

#include "platform/base/Result.h"
#include "platform/base/Url.h"

#include <functional>
#include <optional>

namespace platform {

class CloudAccountService;
class CloudDocumentService;
class CloudService;
class DirectoryWatcher;
class FileProgressSubscription;
class MainQueue;
class NotificationCenter;

/// What the screens of this folder ask of the rest of the platform. All of it outlives them.
struct DocumentServices {
    MainQueue& mainQueue;
    NotificationCenter& notifications;
    CloudDocumentService& documents;
    CloudAccountService& accounts;
    CloudService& cloud;
    DirectoryWatcher& watcher;
    FileProgressSubscription& progress;

    /// Those of the installed platform.
    static DocumentServices current();
};

} // namespace platform
