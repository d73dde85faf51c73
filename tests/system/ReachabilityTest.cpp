#include "platform/base/Clock.h"
#include "platform/system/ReachabilityService.h"
#include "tests/support/TemporaryFolder.h"
#include "tests/system/NetworkReports.h"

#include <gtest/gtest.h>

#include <filesystem>

namespace fs = std::filesystem;
using namespace platform;
using test::cellular;
using test::NetworkReports;
using test::wifi;

namespace {

struct Scripted : ::testing::Test {
    test::TemporaryFolder folder;
    std::unique_ptr<ReachabilityService> givenFile(std::string_view word) const {
        return makeScriptedReachability("file:" + folder.write("network", word));
    }
};

TEST_F(Scripted, WordsAreTheirStates) {
    for (const auto& [word, flags] :
         {std::pair{"wifi", wifi}, {"cellular", cellular}, {"offline", 0U}}) {
        const auto service = makeScriptedReachability(word);
        ASSERT_TRUE(service);
        EXPECT_TRUE(NetworkReports(*service).waitFor({flags})) << word;
    }
    for (const char* word : {"", "Wifi", "wifi ", "lan", "file:", "file:network", "live"})
        EXPECT_FALSE(makeScriptedReachability(word)) << word;
}

TEST_F(Scripted, AFileIsSwitchedWhileItRuns) {
    const auto service = givenFile("wifi\n");
    NetworkReports reports(*service);
    ASSERT_TRUE(reports.waitFor({wifi}));
    folder.write("next", " cellular");
    fs::rename(folder / "next", folder / "network");
    ASSERT_TRUE(reports.waitFor({wifi, cellular}));
    fs::remove(folder / "network");
    ASSERT_TRUE(reports.waitFor({wifi, cellular, 0})) << "no file, no network";
    folder.write("next", "wifi");
    fs::rename(folder / "next", folder / "network");
    EXPECT_TRUE(reports.waitFor({wifi, cellular, 0, wifi}));
}

TEST_F(Scripted, AWordThatNobodyKnowsLeavesTheLiveNetwork) {
    const auto clock = makeRealClock();
    const auto service = makeReachability(*clock, "lan");
    service->setWatchedRemote(WatchedRemote{folder.path(), {}});
    EXPECT_TRUE(NetworkReports(*service).waitFor({wifi}));
}

struct Attachment : Scripted {
    std::unique_ptr<ReachabilityService> service = givenFile("wifi");
    NetworkReports reports{*service};

    void switchTo(std::string_view word) const {
        folder.write("next", word);
        fs::rename(folder / "next", folder / "network");
    }
};

TEST_F(Attachment, BeginsWithTheStateAsItIs) {
    ASSERT_TRUE(reports.waitFor({wifi}));
    reports.detachQueue();
    NetworkReports other(*service);
    switchTo("offline");
    ASSERT_TRUE(other.waitFor({wifi, 0}));
    reports.attachQueue();
    EXPECT_TRUE(reports.waitFor({wifi, 0}));
}

TEST_F(Attachment, NothingIsReportedOnceItEnded) {
    ASSERT_TRUE(reports.waitFor({wifi}));
    bool ended = false;
    reports.onReport([&] {
        EXPECT_FALSE(ended);
        reports.detachCallback(); // from within the report itself
        ended = true;
    });
    NetworkReports other(*service);
    switchTo("offline");
    switchTo("cellular");
    ASSERT_TRUE(other.waitForLast(cellular));
    reports.finishQueue();
    EXPECT_TRUE(ended);
    EXPECT_EQ(reports.all().size(), 2U);
}

TEST_F(Attachment, WhoeverDetachesWaitsForTheReportThatRuns) {
    ASSERT_TRUE(reports.waitFor({wifi}));
    std::atomic<bool> running{false};
    std::atomic<bool> over{false};
    reports.onReport([&] {
        running = true;
        running.notify_all();
        // Long enough for the other thread to come to its wait, if it comes too early.
        for (int i = 0; i < 1000; ++i)
            std::this_thread::yield();
        over = true;
    });
    switchTo("offline");
    running.wait(false);
    reports.detachCallback();
    EXPECT_TRUE(over);
}

struct Live : ::testing::Test {
    test::TemporaryFolder folder;
    std::unique_ptr<Clock> clock = makeRealClock();
    std::unique_ptr<ReachabilityService> service = makeLiveReachability(*clock);
};

TEST_F(Live, TheAccountsFolderStandsForTheHostWhileItIsThere) {
    const std::string remote = folder / "disk/remote";
    NetworkReports reports(*service, "host.invalid");
    ASSERT_TRUE(reports.waitFor({0})) << "a name that does not exist";
    service->setWatchedRemote(WatchedRemote{remote, {}});
    fs::create_directories(remote);
    ASSERT_TRUE(reports.waitFor({0, wifi}));
    fs::rename(folder / "disk", folder / "unplugged");
    ASSERT_TRUE(reports.waitFor({0, wifi, 0}));
    folder.write("disk/remote", "a file");
    fs::remove_all(folder / "disk");
    fs::rename(folder / "unplugged", folder / "disk");
    ASSERT_TRUE(reports.waitFor({0, wifi, 0, wifi}));
    service->setWatchedRemote(std::nullopt);
    EXPECT_TRUE(reports.waitFor({0, wifi, 0, wifi, 0})) << "the host itself again";
}

TEST_F(Live, NoTargetForNoHost) {
    EXPECT_FALSE(service->createTarget(""));
}

} // namespace
