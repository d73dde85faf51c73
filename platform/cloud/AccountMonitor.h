#pragma once

#include "platform/base/MainQueue.h"
#include "platform/cloud/AccountFile.h"
#include "platform/files/DirectoryWatcher.h"

#include <functional>
#include <string>

namespace platform {

/// Follows the account file: its folder may come and go, and the file may be written by any
/// program. Main thread.
class AccountMonitor {
public:
    /// `changed` is called on the main thread, once for each change of what the file says.
    AccountMonitor(const Folders& folders, MainQueue& main, DirectoryWatcher& watcher,
                   std::function<void()> changed);
    ~AccountMonitor();
    AccountMonitor(const AccountMonitor&) = delete;
    AccountMonitor& operator=(const AccountMonitor&) = delete;

    const AccountReading& reading() const { return reading_; }
    /// Reads the file now, before a notice tells of a change.
    void look();

private:
    struct Alive;
    /// Watches the account folder or, while it is not there, the nearest folder above it.
    void watchNearest();

    Folders folders_;
    MainQueue& main_;
    DirectoryWatcher& watcher_;
    std::function<void()> changed_;
    AccountReading reading_;
    std::string watched_;
    DirectoryWatcher::Token watch_;
    Timer poll_;
    std::shared_ptr<Alive> alive_;
};

} // namespace platform
