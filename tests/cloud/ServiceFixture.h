#pragma once

#include "platform/base/ManualClock.h"
#include "platform/base/Runtime.h"
#include "platform/cloud/AccountFile.h"
#include "platform/cloud/CloudService.h"
#include "platform/files/ContentProvider.h"
#include "platform/files/DirectoryWatcher.h"
#include "platform/files/Progress.h"
#include "tests/support/TemporaryFolder.h"

#include <gtest/gtest.h>

#include <condition_variable>
#include <memory>
#include <mutex>
#include <string>

namespace test {

/// The whole cloud service on a home of its own, with time that moves only when told.
struct ServiceFixture : ::testing::Test {
    TemporaryFolder home;
    platform::Folders folders{home.path(),    home / "config", home / "data",
                              home / "state", home / "cache",  home / "run"};
    platform::ManualClock clock;
    platform::MainQueue main{clock};
    platform::NotificationCenter notifications;
    platform::Runtime runtime{clock, main, notifications, folders};
    std::unique_ptr<platform::DirectoryWatcher> watcher;
    platform::FileProgressSubscription progress;
    std::unique_ptr<platform::CloudService> cloud;

    ServiceFixture();
    ~ServiceFixture() override;

    std::string givenRemote(const std::string& path, const std::string& content = "") const {
        return home.write("remote/" + path, content);
    }
    void givenAccountFile(const std::string& text) const {
        home.write("config/pelmora/account.json", text);
    }
    platform::AccountRecord account(const std::string& folder = "remote") const;
    void signIn(const platform::AccountRecord& record) const;
    /// Starts the service as a program that may change the store.
    void start(bool readOnly = false);
    void stop() { cloud.reset(); }
    /// Everything that the remote has is in the store.
    platform::Failure readAll();
    /// Signs in, starts and reads all.
    void givenStore();

    platform::Url url(const std::string& path) const;
    std::string problem() const { return cloud->accounts().problem().value_or(""); }
    /// Runs the main queue, and lets other threads fill it, until the condition holds.
    void runUntil(const std::function<bool()>& holds);

private:
    std::mutex mutex_;
    std::condition_variable woken_;
    bool awake_ = false;
};

} // namespace test
