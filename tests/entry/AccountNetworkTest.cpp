#include "platform/Platform.h"
#include "platform/cloud/AccountFile.h"
#include "platform/system/ReachabilityService.h"
#include "tests/support/TemporaryFolder.h"

#include <gtest/gtest.h>

#include <condition_variable>
#include <mutex>

using namespace platform;

namespace {

/// Only writes down whose network is watched.
struct WatchedNetwork : ReachabilityService {
    explicit WatchedNetwork(std::vector<std::optional<WatchedRemote>>& theRemotes)
        : remotes(theRemotes) {}
    std::unique_ptr<ReachabilityTarget> createTarget(const std::string& /*host*/) override {
        return nullptr;
    }
    void setWatchedRemote(const std::optional<WatchedRemote>& remote) override {
        remotes.push_back(remote);
    }
    std::vector<std::optional<WatchedRemote>>& remotes;
};

struct AccountNetwork : ::testing::Test {
    test::TemporaryFolder home;
    Folders folders{home.path(),    home / "config", home / "data",
                    home / "state", home / "cache",  {}};
    std::vector<std::optional<WatchedRemote>> remotes;
    std::mutex mutex;
    std::condition_variable woken;
    bool isWoken = false;
    std::unique_ptr<Platform> services;

    void givenServices() {
        PlatformParts parts;
        parts.folders = folders;
        parts.reachability = std::make_unique<WatchedNetwork>(remotes);
        services = std::make_unique<Platform>(std::move(parts));
        services->mainQueue().setWake([this] {
            const std::lock_guard lock(mutex);
            isWoken = true;
            woken.notify_one();
        });
    }
    bool runUntilWatched(const std::optional<WatchedRemote>& remote) {
        const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(20);
        for (;;) {
            services->mainQueue().drainAll();
            if (!remotes.empty() && remotes.back() == remote)
                return true;
            std::unique_lock lock(mutex);
            if (!woken.wait_until(lock, deadline, [this] { return std::exchange(isWoken, false); }))
                return false;
        }
    }
    void signIn(const std::string& remote) {
        home.makeFolder(remote);
        ASSERT_EQ(writeAccount(folders, {"folder", home / remote, "Nora", Bytes(16), {}, {}}),
                  std::nullopt);
    }
};

TEST_F(AccountNetwork, TheNetworkThatIsWatchedIsTheAccountsOwn) {
    signIn("first");
    givenServices();
    ASSERT_EQ(remotes.size(), 1U) << "before anybody asks for it";
    EXPECT_EQ(remotes[0], (WatchedRemote{home / "first", {}}));
    signIn("second");
    EXPECT_TRUE(runUntilWatched(WatchedRemote{home / "second", {}}));
    ASSERT_EQ(removeAccount(folders), std::nullopt);
    EXPECT_TRUE(runUntilWatched(std::nullopt));
}

} // namespace
