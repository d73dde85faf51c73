#include "platform/system/NotifyService.h"
#include "platform/base/WorkQueue.h"

#include "tests/support/TemporaryFolder.h"

#include <gtest/gtest.h>

#include <condition_variable>
#include <filesystem>
#include <mutex>

namespace fs = std::filesystem;
using platform::NotifyService;

namespace {

struct Notices : ::testing::Test {
    test::TemporaryFolder folder;
    platform::WorkQueue queue{"test.notices"};
    std::mutex mutex;
    std::condition_variable changed;
    int heard = 0;

    std::unique_ptr<NotifyService> givenProcess() const {
        return platform::makeNotifyService(folder / "run/notices", folder / "etc/managed.json");
    }
    NotifyService::Token observe(NotifyService& service, std::string_view name) {
        return service.observe(name, queue, [this] {
            const std::lock_guard lock(mutex);
            ++heard;
            changed.notify_all();
        });
    }
    bool waitFor(int count) {
        std::unique_lock lock(mutex);
        return changed.wait_for(lock, std::chrono::seconds(20), [&] { return heard >= count; });
    }
};

TEST_F(Notices, AreHeardByEveryProcessUnderTheirNameOnly) {
    const auto sender = givenProcess();
    const auto receiver = givenProcess();
    const auto token = observe(*receiver, "com.example/changed");
    const auto own = observe(*sender, "com.example/changed");
    sender->post("com.example.other");
    sender->post("com.example/changed");
    ASSERT_TRUE(waitFor(2));
    for (int i = 1; i <= 20; ++i) { // one at a time, none is lost
        receiver->post("com.example/changed");
        ASSERT_TRUE(waitFor(2 + 2 * i));
    }
    EXPECT_EQ(heard, 42) << "each once";
}

TEST_F(Notices, EndWithTheToken) {
    const auto service = givenProcess();
    auto token = observe(*service, "a");
    token.reset();
    service->post("a");
    const auto marker = observe(*service, "b");
    service->post("b");
    ASSERT_TRUE(waitFor(1));
    queue.sync([] {});
    EXPECT_EQ(heard, 1);
}

TEST_F(Notices, SurviveACleanedFolder) {
    const auto service = givenProcess();
    const auto token = observe(*service, "a");
    fs::remove_all(folder / "run");
    service->post("a");
    EXPECT_TRUE(waitFor(1));
}

TEST_F(Notices, ManagedSettingsAreHeardThroughTheirFileAlsoWhenItsFolderIsMadeLater) {
    const auto service = givenProcess();
    const auto token = observe(*service, platform::managedSettingsChangedNotice);
    folder.write("etc/managed.json", "{}");
    ASSERT_TRUE(waitFor(1));
    const int before = heard;
    fs::rename(folder.write("etc/new", "{\"GridMode\": true}"), folder / "etc/managed.json");
    ASSERT_TRUE(waitFor(before + 1));
    service->post(platform::managedSettingsChangedNotice);
    EXPECT_TRUE(waitFor(before + 2));
}

} // namespace
