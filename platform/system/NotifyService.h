#pragma once

#include "platform/base/Executor.h"

#include <memory>
#include <string>
#include <string_view>

namespace platform {

/// Posted when an administrator's managed settings changed.
inline constexpr std::string_view managedSettingsChangedNotice =
    "com.pelmora.managed-settings.changed";

/// Named notices between the processes of one user, without content. Safe from any thread.
class NotifyService {
public:
    using Token = std::shared_ptr<void>;
    virtual ~NotifyService() = default;
    /// `handler` runs on `queue` for every notice of that name (several in quick succession may
    /// arrive as one) until the token is dropped.
    [[nodiscard]] virtual Token observe(std::string_view name, Executor& queue, Job handler) = 0;
    virtual void post(std::string_view name) = 0;
};

/// Notices are touches of files below `folder`, heard through the kernel; the managed-settings
/// notice is heard for changes of `managedFile` as well.
std::unique_ptr<NotifyService> makeNotifyService(std::string folder, std::string managedFile);

} // namespace platform
