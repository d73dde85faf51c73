#include "platform/files/DirectoryWatcher.h"
#include "platform/base/Log.h"
#include "platform/base/ManualClock.h"
#include "platform/base/Runtime.h"
#include "platform/base/WorkQueue.h"
#include "platform/files/ItemWatch.h"

#include "tests/support/TemporaryFolder.h"

#include <gtest/gtest.h>

#include <condition_variable>
#include <filesystem>
#include <fstream>
#include <mutex>
#include <sys/resource.h>

namespace fs = std::filesystem;
using platform::DirectoryChange;
using platform::DirectoryWatcher;
using platform::Url;
using Kind = DirectoryChange::Kind;

namespace {

struct Watching : ::testing::Test {
    test::TemporaryFolder folder;
    platform::WorkQueue queue{"test.watch"};
    std::mutex mutex;
    std::condition_variable heard;
    std::vector<DirectoryChange> changes;
    // Ended before the queue and what the handlers write to.
    DirectoryWatcher watcher;

    Url at(std::string_view name) const { return Url::file(folder / name); }
    DirectoryWatcher::Handler handler() {
        return [this](const std::vector<DirectoryChange>& batch) {
            const std::lock_guard lock(mutex);
            changes.insert(changes.end(), batch.begin(), batch.end());
            heard.notify_all();
        };
    }
    /// The first change of that kind and name, once it has come.
    std::optional<DirectoryChange> waitFor(Kind kind, std::string_view name = {}) {
        std::unique_lock lock(mutex);
        std::optional<DirectoryChange> found;
        heard.wait_for(lock, std::chrono::seconds(20), [&] {
            for (const DirectoryChange& change : changes)
                if (change.kind == kind && change.name == name)
                    found = change;
            return found.has_value();
        });
        return found;
    }
    std::size_t count(std::string_view name) {
        const std::lock_guard lock(mutex);
        return static_cast<std::size_t>(
            std::count_if(changes.begin(), changes.end(),
                          [&](const DirectoryChange& change) { return change.name == name; }));
    }
};

TEST_F(Watching, EntriesAreReportedWithTheirKindAndRenamesInPairs) {
    const auto token = watcher.watch(Url::file(folder.path()), queue, handler());
    folder.write("a", "1");
    fs::rename(folder / "a", folder / "b");
    folder.makeFolder("sub");
    fs::permissions(folder / "b", fs::perms::owner_read);
    fs::remove(folder / "b");
    ASSERT_TRUE(waitFor(Kind::removed, "b"));
    EXPECT_TRUE(waitFor(Kind::created, "a"));
    EXPECT_TRUE(waitFor(Kind::modified, "a"));
    EXPECT_TRUE(waitFor(Kind::attributes, "b"));
    EXPECT_TRUE(waitFor(Kind::created, "sub")->isDirectory);
    const auto from = waitFor(Kind::movedFrom, "a");
    const auto to = waitFor(Kind::movedTo, "b");
    ASSERT_TRUE(from && to);
    EXPECT_EQ(from->cookie, to->cookie);
    EXPECT_NE(from->cookie, 0U);
}

TEST_F(Watching, NothingIsReportedOnceTheTokenIsDropped) {
    auto first = watcher.watch(Url::file(folder.path()), queue, handler());
    const auto second = watcher.watch(Url::file(folder.path()), queue, handler());
    folder.write("both");
    ASSERT_TRUE(waitFor(Kind::created, "both"));
    first.reset();
    folder.write("one");
    folder.write("end");
    ASSERT_TRUE(waitFor(Kind::modified, "end"));
    queue.sync([] {});
    EXPECT_LE(count("one"), 2U) << "created and modified, by the one that is left";
}

TEST_F(Watching, AFolderThatGoesIsReportedAndSaysNothingMore) {
    folder.makeFolder("moved");
    folder.makeFolder("removed");
    std::vector<DirectoryWatcher::Token> tokens;
    tokens.push_back(watcher.watch(at("moved"), queue, handler()));
    fs::rename(folder / "moved", folder / "elsewhere");
    ASSERT_TRUE(waitFor(Kind::folderGone));
    folder.write("elsewhere/late");
    {
        const std::lock_guard lock(mutex);
        changes.clear();
    }
    tokens.push_back(watcher.watch(at("removed"), queue, handler()));
    fs::remove(folder / "removed");
    ASSERT_TRUE(waitFor(Kind::folderGone));
    EXPECT_EQ(count("late"), 0U);
    EXPECT_FALSE(watcher.watch(at("removed"), queue, handler()));
}

TEST_F(Watching, ATokenMayBeDroppedWithinItsHandlerAndWithTheWatcher) {
    DirectoryWatcher::Token token;
    const auto note = handler();
    std::mutex assignment;
    {
        const std::lock_guard lock(assignment);
        token = watcher.watch(Url::file(folder.path()), queue, [&](const auto& batch) {
            const std::lock_guard inner(assignment);
            token.reset();
            note(batch);
        });
    }
    folder.write("a");
    ASSERT_TRUE(waitFor(Kind::created, "a"));
    auto other = std::make_unique<DirectoryWatcher>();
    const auto orphan = other->watch(Url::file(folder.path()), queue, note);
    other.reset();
    const auto last = watcher.watch(Url::file(folder.path()), queue, note);
    folder.write("b");
    ASSERT_TRUE(waitFor(Kind::modified, "b"));
    EXPECT_LE(count("b"), 2U);
}

TEST_F(Watching, LostNoticesAreReportedAsOverflow) {
    std::ifstream limits("/proc/sys/fs/inotify/max_queued_events");
    std::size_t limit = 0;
    limits >> limit;
    if (limit == 0 || limit > 100'000)
        GTEST_SKIP() << "too large a queue to fill";
    // Nobody reads while the handler of an executor that runs jobs at once holds the thread up.
    struct Inline final : platform::Executor {
        void async(platform::Job job) override { job(); }
    } atOnce;
    folder.makeFolder("slow");
    std::mutex gate;
    std::unique_lock closed(gate);
    const auto blocking =
        watcher.watch(at("slow"), atOnce, [&](const auto&) { const std::lock_guard wait(gate); });
    const auto token = watcher.watch(Url::file(folder.path()), queue, handler());
    folder.write("slow/first");
    for (std::size_t i = 0; i <= limit; ++i)
        fs::rename(folder / (i % 2 ? "slow/other" : "slow/first"),
                   folder / (i % 2 ? "slow/first" : "slow/other"));
    closed.unlock();
    EXPECT_TRUE(waitFor(Kind::overflow));
}

TEST_F(Watching, AnItemIsHeardOfThroughAllComingAndGoingOfItsFolders) {
    std::atomic<int> touches{0};
    const platform::ItemWatch watch(watcher, folder / "a/b/item", platform::ItemWatch::Scope::item,
                                    queue, [&] {
                                        const std::lock_guard lock(mutex);
                                        ++touches;
                                        heard.notify_all();
                                    });
    const auto touchedBy = [&](const std::function<void()>& change) {
        std::unique_lock lock(mutex);
        const int before = touches;
        lock.unlock();
        change();
        lock.lock();
        return heard.wait_for(lock, std::chrono::seconds(20), [&] { return touches > before; });
    };
    EXPECT_TRUE(touchedBy([&] { folder.write("a/b/item", "1"); }));
    queue.sync([] {});
    EXPECT_TRUE(touchedBy([&] { fs::rename(folder / "a", folder / "away"); }));
    EXPECT_TRUE(touchedBy([&] { folder.write("a/b/other"); })) << "the folders are back";
    queue.sync([] {});
    EXPECT_TRUE(touchedBy([&] { folder.write("a/b/item", "2"); }));
    const int before = touches;
    folder.write("away/b/item", "not here any more");
    folder.write("a/b/other", "not this one");
    EXPECT_TRUE(touchedBy([&] { fs::remove(folder / "a/b/item"); }));
    EXPECT_GT(touches, before);
}

/// With no descriptor left for the kernel's notices, as when the machine's watches are used up.
TEST_F(Watching, WithoutWatchesFoldersAreReportedAsOverflownFromTimeToTime) {
#ifdef __SANITIZE_ADDRESS__
    GTEST_SKIP() << "its checks need descriptors themselves";
#endif
    platform::ManualClock clock;
    platform::MainQueue main(clock);
    platform::NotificationCenter notifications;
    platform::Runtime runtime{clock, main, notifications, {}};
    platform::Runtime::install(&runtime);
    std::atomic<int> warnings{0};
    platform::setLogSink(
        {[](int) { return true; }, [&](int, const std::string&, const auto&) { ++warnings; }});
    rlimit before{};
    ASSERT_EQ(::getrlimit(RLIMIT_NOFILE, &before), 0);
    const rlimit none{0, before.rlim_max};
    ASSERT_EQ(::setrlimit(RLIMIT_NOFILE, &none), 0);
    // What other cases watched may not be closed yet.
    DirectoryWatcher::Token first;
    for (int tries = 0; warnings == 0 && tries < 10'000; ++tries) {
        first.reset();
        std::this_thread::yield();
        first = watcher.watch(Url::file(folder.path()), queue, handler());
    }
    const auto second = watcher.watch(Url::file(folder.path()), queue, handler());
    ASSERT_EQ(::setrlimit(RLIMIT_NOFILE, &before), 0);
    EXPECT_TRUE(first && second);
    EXPECT_EQ(warnings, 1) << "said once";
    clock.advance(std::chrono::seconds(29));
    queue.sync([] {});
    EXPECT_TRUE(changes.empty());
    clock.advance(std::chrono::seconds(1));
    EXPECT_TRUE(waitFor(Kind::overflow));
    folder.write("a"); // descriptors are back, so the folder is watched by now
    EXPECT_TRUE(waitFor(Kind::created, "a"));
    platform::setLogSink({});
    platform::Runtime::install(nullptr);
}

} // namespace
