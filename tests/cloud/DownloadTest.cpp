#include "tests/cloud/StoreFixture.h"

#include <fcntl.h>
#include <future>
#include <sys/stat.h>
#include <unistd.h>

using namespace platform;
using namespace std::chrono_literals;

namespace {

/// A remote that lets a test do something in the middle of a content.
class InterruptedRemote final : public test::ForwardingRemote {
public:
    InterruptedRemote(std::unique_ptr<Remote> real, std::function<void()> middle)
        : ForwardingRemote(std::move(real)), middle_(std::move(middle)) {}
    Result<RemoteEntry> read(const std::string& path, const Sink& sink,
                             CancelFlag& cancel) override {
        return real_->read(
            path,
            [&](std::span<const std::byte> piece) {
                middle_();
                return sink(piece);
            },
            cancel);
    }

private:
    std::function<void()> middle_;
};

struct Download : test::StoreFixture {
    const std::string content = std::string(300'000, 'a') + "end";
    CancelFlag stop;

    void givenListed(const std::string& path) {
        givenRemote(path, content);
        ASSERT_EQ(open(), std::nullopt);
        ASSERT_EQ(list(), std::nullopt);
    }
    void inTheMiddle(std::function<void()> middle) {
        remote = std::make_unique<InterruptedRemote>(std::move(remote), std::move(middle));
    }
    std::future<Failure> startFetch(const std::string& path, CancelFlag& flag) {
        return std::async(std::launch::async,
                          [this, path, &flag] { return transfers->fetch(url(path), flag); });
    }
    void expectPromiseAlone(const std::string& path) {
        EXPECT_TRUE(isPromised(path));
        EXPECT_EQ(stagedFiles(), 0U);
        EXPECT_TRUE(state(path)->local->promise);
    }
};

TEST_F(Download, PutsTheWholeContentInPlaceOfThePromise) {
    const std::string path = givenRemote("A/one.txt", content);
    ASSERT_EQ(setExtendedAttribute(Url::file(path), "user.xdg.tags", "green"), std::nullopt);
    const timespec times[2] = {{1'500'000'000, 0}, {1'500'000'000, 123}};
    ASSERT_EQ(utimensat(AT_FDCWD, path.c_str(), times, 0), 0);
    givenListed("A/other.txt");
    ASSERT_EQ(fetch("A/one.txt"), std::nullopt);
    EXPECT_EQ(local("A/one.txt"), content);
    EXPECT_FALSE(sidecar("A/one.txt"));
    EXPECT_EQ(stagedFiles(), 0U);
    const auto attributes = FileManager::attributes(url("A/one.txt").path(), FollowLinks::no);
    EXPECT_EQ(attributes->modified, Date::fromParts(1'500'000'000, 123));
    EXPECT_EQ(extendedAttribute(url("A/one.txt").path(), "user.xdg.tags"), "green");
    const auto record = state("A/one.txt");
    EXPECT_EQ(record->local->identity, attributes->identity);
    EXPECT_FALSE(record->local->promise);
    EXPECT_EQ(record->base->hash.size(), 32U);
    EXPECT_EQ(fetch("A/one.txt"), std::nullopt) << "a local file is no work";
}

TEST_F(Download, StoppedAtAnyStepLeavesThePromiseOrTheFile) {
    for (int step = 1;; ++step) {
        givenRemote("A/one.txt", content);
        ASSERT_EQ(open(), std::nullopt);
        ASSERT_EQ(list(), std::nullopt);
        close();
        const int code = test::inAnotherProcess([&] {
            disk = test::dyingFileSystem((step + 1) / 2, step % 2 == 0);
            return open() || fetch("A/one.txt") ? 1 : 0;
        });
        ASSERT_TRUE(code == 0 || code == test::diedOnTheWay) << "step " << step;
        ASSERT_TRUE(isPromised("A/one.txt") || local("A/one.txt") == content) << "step " << step;
        ASSERT_EQ(open(), std::nullopt) << "step " << step;
        const bool there = local("A/one.txt").has_value();
        EXPECT_EQ(sidecar("A/one.txt").has_value(), !there) << "step " << step;
        EXPECT_EQ(state("A/one.txt")->local->promise, !there) << "step " << step;
        EXPECT_EQ(stagedFiles(), 0U) << "step " << step;
        EXPECT_TRUE(store->database->operations().empty()) << "step " << step;
        EXPECT_EQ(fetch("A/one.txt"), std::nullopt) << "step " << step;
        EXPECT_EQ(local("A/one.txt"), content) << "step " << step;
        close();
        if (code == 0)
            break;
        ASSERT_EQ(FileManager::removeItem(Url::file(layout.folder)), std::nullopt);
    }
}

TEST_F(Download, ASourceThatChangesIsReadAgainAndNeverMixed) {
    int pieces = 0;
    inTheMiddle([&] {
        if (++pieces == 1)
            givenRemote("A/one.txt", std::string(300'003, 'b'));
    });
    givenListed("A/one.txt");
    ASSERT_EQ(fetch("A/one.txt"), std::nullopt);
    EXPECT_EQ(local("A/one.txt"), std::string(300'003, 'b'));
    EXPECT_EQ(state("A/one.txt")->base->etag, state("A/one.txt")->remote->etag);
}

TEST_F(Download, ASourceThatNeverRestsFailsAndLeavesThePromise) {
    int version = 0;
    inTheMiddle([&] { givenRemote("A/one.txt", content + std::to_string(++version)); });
    givenListed("A/one.txt");
    EXPECT_TRUE(fetch("A/one.txt")->is(ErrorCode::changedWhileRead));
    expectPromiseAlone("A/one.txt");
}

TEST_F(Download, ACancellationLeavesThePromiseAlone) {
    inTheMiddle([&] { stop.cancel(); });
    givenListed("A/one.txt");
    EXPECT_TRUE(transfers->fetch(url("A/one.txt"), stop)->is(ErrorCode::userCancelled));
    expectPromiseAlone("A/one.txt");
}

TEST_F(Download, AFileGoneFromTheRemoteIsNotThere) {
    givenListed("A/one.txt");
    unlink((home / "remote/A/one.txt").c_str());
    EXPECT_TRUE(fetch("A/one.txt")->is(ErrorCode::noSuchItem));
    expectPromiseAlone("A/one.txt");
}

TEST_F(Download, AFullDiskSaysSo) {
    givenRemote("A/one.txt", content);
    ASSERT_EQ(open(), std::nullopt);
    ASSERT_EQ(list(), std::nullopt);
    close();
    disk = test::fullFileSystem();
    ASSERT_EQ(open(), std::nullopt);
    const Failure refused = fetch("A/one.txt");
    ASSERT_TRUE(refused && refused->is(ErrorCode::outOfSpace));
    EXPECT_NE(refused->localizedDescription->find("one.txt"), std::string::npos)
        << "not the name of what was staged";
    expectPromiseAlone("A/one.txt");
}

TEST_F(Download, RoomIsKeptForWhatComesNextAndNothingBegunThatCannotFit) {
    const auto real = makeRealStoreFileSystem();
    const std::string path = home / "staged";
    const auto refused = real->stage(path, 1ULL << 50);
    ASSERT_TRUE(!refused && refused.error().is(ErrorCode::outOfSpace));
    EXPECT_FALSE(FileManager::exists(path));
    constexpr std::uint64_t MiB = 1 << 20;
    const auto staged = real->stage(path, 256 * MiB);
    ASSERT_TRUE(staged);
    const Bytes piece(35 * MiB, std::byte{7});
    for (const std::uint64_t most : {64 * MiB, 128 * MiB}) {
        struct stat status {};
        ASSERT_EQ(::stat(path.c_str(), &status), 0);
        EXPECT_LE(static_cast<std::uint64_t>(status.st_blocks) * 512, most + MiB);
        ASSERT_EQ((*staged)->write(piece), std::nullopt);
    }
    ASSERT_EQ((*staged)->finish(Date(), ""), std::nullopt);
    EXPECT_EQ(FileManager::attributes(path, FollowLinks::no)->size, 70 * MiB);
}

TEST_F(Download, SomebodysFileInThePlaceOfThePromiseStays) {
    inTheMiddle([&] { givenLocal("A/one.txt", "written meanwhile"); });
    givenListed("A/one.txt");
    EXPECT_TRUE(fetch("A/one.txt")->is(ErrorCode::fileExists));
    EXPECT_EQ(local("A/one.txt"), "written meanwhile");
    EXPECT_EQ(stagedFiles(), 0U);
}

TEST_F(Download, TwoCallersShareATransferThatEndsWithTheLastOfThem) {
    std::atomic<int> reads{0};
    std::promise<void> reached;
    std::promise<void> goOn;
    inTheMiddle([&] {
        if (++reads == 1) {
            reached.set_value();
            goOn.get_future().wait();
        }
    });
    givenListed("A/one.txt");
    CancelFlag other;
    std::future<Failure> first = startFetch("A/one.txt", stop);
    reached.get_future().wait();
    std::future<Failure> second = startFetch("A/one.txt", other);
    std::promise<void> published;
    const auto token = progress.addSubscriber(url("A/one.txt"), [&](const auto&) {
        published.set_value(); // once: the callers share one
        return FileProgressSubscription::Unpublished();
    });
    published.get_future().wait();
    goOn.set_value();
    EXPECT_EQ(first.get(), std::nullopt);
    EXPECT_EQ(second.get(), std::nullopt);
    EXPECT_EQ(reads, 1);
}

TEST_F(Download, OneOfTwoCallersMayGoWithoutTheOtherLosingIt) {
    std::promise<void> reached;
    std::promise<void> goOn;
    inTheMiddle([&, first = true]() mutable {
        if (std::exchange(first, false)) {
            reached.set_value();
            goOn.get_future().wait();
        }
    });
    givenListed("A/one.txt");
    CancelFlag leaving;
    std::future<Failure> stays = startFetch("A/one.txt", stop);
    reached.get_future().wait();
    std::future<Failure> leaves = startFetch("A/one.txt", leaving);
    leaving.cancel();
    EXPECT_TRUE(leaves.get()->is(ErrorCode::userCancelled));
    goOn.set_value();
    EXPECT_EQ(stays.get(), std::nullopt);
    EXPECT_EQ(local("A/one.txt"), content);
}

TEST_F(Download, ARateIsKeptByTheClock) {
    rateLimit = 100'000;
    givenListed("A/one.txt");
    std::promise<void> begun;
    std::atomic<std::int64_t> completed{0};
    const auto token = progress.addSubscriber(url("A/one.txt"), [&](const auto& shown) {
        shown->addObserver([&](const Progress& now) { completed = now.completedUnitCount(); });
        begun.set_value();
        return FileProgressSubscription::Unpublished();
    });
    const Duration start = clock.monotonic();
    std::future<Failure> fetching = startFetch("A/one.txt", stop);
    begun.get_future().wait();
    while (fetching.wait_for(0s) != std::future_status::ready) {
        clock.advance(10ms);
        const double elapsed = std::chrono::duration<double>(clock.monotonic() - start).count();
        EXPECT_LE(static_cast<double>(completed), 100'000 * elapsed + 12'500);
    }
    EXPECT_EQ(fetching.get(), std::nullopt);
    EXPECT_GE(clock.monotonic() - start, 3s) << "300,003 bytes at 100,000 a second";
}

TEST_F(Download, ACancellationIsFeltWhileTheRateHoldsItBack) {
    rateLimit = 1024;
    givenListed("A/one.txt");
    std::promise<void> begun;
    const auto token = progress.addSubscriber(url("A/one.txt"), [&](const auto&) {
        begun.set_value();
        return FileProgressSubscription::Unpublished();
    });
    std::future<Failure> fetching = startFetch("A/one.txt", stop);
    begun.get_future().wait();
    stop.cancel(); // the clock stands still
    EXPECT_TRUE(fetching.get()->is(ErrorCode::userCancelled));
    expectPromiseAlone("A/one.txt");
}

} // namespace
