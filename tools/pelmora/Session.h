#pragma once

#include "platform/base/Runtime.h"
#include "platform/cloud/CloudService.h"
#include "platform/files/ContentProvider.h"
#include "platform/files/DirectoryWatcher.h"
#include "platform/files/Progress.h"

#include <memory>
#include <optional>
#include <string>

namespace pelmora {

/// The store of the signed-in account, opened for one command.
class Session {
public:
    enum class Purpose { look, change };
    explicit Session(Purpose purpose);
    ~Session();
    Session(const Session&) = delete;
    Session& operator=(const Session&) = delete;

    /// Says why there is nothing to work with and answers the exit code; none when all is well.
    std::optional<int> complaint();
    /// Waits until the remote has been read once. None, or the exit code after saying why not.
    std::optional<int> bringIn();
    /// An absolute path, or one relative to the store.
    platform::Url urlOf(const std::string& path) const;

    platform::CloudService& cloud() { return *cloud_; }
    platform::FileProgressSubscription& progress() { return progress_; }
    /// Set by Ctrl-C.
    platform::CancelFlag& cancel() { return *cancel_; }
    bool interruptedByUser() const { return cancel_->isCancelled(); }

private:
    std::shared_ptr<platform::CancelFlag> cancel_;
    std::unique_ptr<platform::Clock> clock_;
    platform::MainQueue main_;
    platform::NotificationCenter notifications_;
    platform::Runtime runtime_;
    platform::DirectoryWatcher watcher_;
    platform::FileProgressSubscription progress_;
    std::unique_ptr<platform::CloudService> cloud_;
};

/// Refreshes and waits; none, or what went wrong.
platform::Failure refreshAndWait(platform::CloudService& cloud,
                                 const std::optional<platform::Url>& folder);
/// The exit code for an error, which it tells.
int complainOf(const platform::Error& error);

} // namespace pelmora
