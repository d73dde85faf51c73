#include "platform/files/Progress.h"
#include "platform/files/ContentProvider.h"

#include <gtest/gtest.h>

#include <future>
#include <random>
#include <thread>

using platform::FileProgressSubscription;
using platform::Progress;
using platform::Url;

namespace {

const Url file = Url::file("/store/Report.pdf");

struct Publishing : ::testing::Test {
    FileProgressSubscription service;
    std::string log;

    std::shared_ptr<Progress> givenProgress() {
        return std::make_shared<Progress>(std::string(platform::fileProgressKind), 100);
    }
    FileProgressSubscription::Token subscribe(const Url& url = file) {
        return service.addSubscriber(url, [this](const std::shared_ptr<Progress>&) {
            log += "p";
            return [this] { log += "u"; };
        });
    }
};

TEST_F(Publishing, SubscribersHearOfWhatIsUnderWayAndOfWhatComes) {
    auto first = service.publish(file, givenProgress());
    const auto token = subscribe(Url::file("/store/./Report.pdf/"));
    EXPECT_EQ(log, "p");
    auto second = service.publish(file, givenProgress());
    auto other = service.publish(Url::file("/store/Other.pdf"), givenProgress());
    EXPECT_EQ(log, "pp");
    first.reset();
    EXPECT_EQ(log, "ppu");
    second.reset();
    other.reset();
    EXPECT_EQ(log, "ppuu");
}

TEST_F(Publishing, TheEndOfASubscriptionTakesBackWhatWasToldOnce) {
    auto progress = service.publish(file, givenProgress());
    auto token = subscribe();
    service.removeSubscriber(token);
    EXPECT_EQ(log, "pu");
    service.removeSubscriber(token);
    token.reset();
    progress.reset();
    const auto later = service.publish(file, givenProgress());
    EXPECT_EQ(log, "pu");
}

TEST_F(Publishing, AWithdrawalHandlerMayEndItsOwnSubscription) {
    FileProgressSubscription::Token token;
    token = service.addSubscriber(file, [&](const std::shared_ptr<Progress>& progress) {
        const auto id = progress->addObserver([this](const Progress&) { log += "o"; });
        return [this, &token, progress, id] {
            progress->removeObserver(id);
            service.removeSubscriber(token);
            token.reset();
            log += "u";
        };
    });
    const auto progress = givenProgress();
    auto published = service.publish(file, progress);
    progress->update(1, 100);
    published.reset();
    progress->update(2, 100);
    EXPECT_EQ(log, "ou");
    EXPECT_FALSE(token);
}

TEST_F(Publishing, AnObserverMayEndItselfTheOthersAndTheSubscription) {
    const auto progress = givenProgress();
    const auto published = service.publish(file, progress);
    auto token = subscribe();
    Progress::ObserverId own = 0;
    Progress::ObserverId other = 0;
    own = progress->addObserver([&](const Progress& told) {
        log += std::to_string(told.completedUnitCount());
        progress->removeObserver(own);
        progress->removeObserver(other);
        service.removeSubscriber(token);
    });
    other = progress->addObserver([&](const Progress&) { log += "never"; });
    progress->update(7, 100);
    progress->update(8, 100);
    EXPECT_EQ(log, "p7u");
    EXPECT_DOUBLE_EQ(progress->fractionCompleted(), 0.08);
    EXPECT_EQ(Progress("k").fractionCompleted(), 0) << "no total yet";
}

// Worker threads publish, update and withdraw while others subscribe and leave: what is told is
// taken back exactly once and nothing is called after a subscriber has left.
TEST_F(Publishing, ManyThreadsLeaveNothingHanging) {
    std::vector<std::thread> threads;
    for (unsigned seed = 1; seed <= 3; ++seed) {
        threads.emplace_back([&] {
            for (int i = 0; i < 400; ++i) {
                const auto progress = givenProgress();
                const auto published = service.publish(file, progress);
                progress->update(i, 400);
            }
        });
        threads.emplace_back([&, seed] {
            std::mt19937 random(seed);
            for (int i = 0; i < 400; ++i) {
                const auto balance = std::make_shared<std::atomic<int>>(0);
                auto token = service.addSubscriber(file, [balance](const auto&) {
                    ++*balance;
                    return [balance] { --*balance; };
                });
                for (auto wait = random() % 5; wait > 0; --wait)
                    std::this_thread::yield();
                service.removeSubscriber(token);
                ASSERT_EQ(*balance, 0);
                token.reset();
                ASSERT_EQ(balance.use_count(), 1) << "a handler is still kept";
            }
        });
    }
    for (std::thread& thread : threads)
        thread.join();
}

TEST(CancelFlag, RunsItsHandlerOnceAtOnceOrNotAtAll) {
    int calls = 0;
    platform::CancelFlag flag;
    flag.setHandler([&] { calls += 100; });
    flag.setHandler([&] {
        ++calls;
        flag.setHandler(nullptr); // a handler may take itself away
    });
    flag.cancel();
    flag.cancel();
    EXPECT_EQ(calls, 1);
    flag.setHandler([&] { calls += 10; });
    EXPECT_EQ(calls, 11);
    platform::CancelFlag other;
    other.setHandler([&] { calls = -1; });
    other.setHandler(nullptr);
    other.cancel();
    EXPECT_EQ(calls, 11);
}

TEST(CancelFlag, TakingTheHandlerAwayWaitsForOneThatRuns) {
    platform::CancelFlag flag;
    std::promise<void> entered;
    std::promise<void> leave;
    std::atomic<bool> left{false};
    flag.setHandler([&] {
        entered.set_value();
        leave.get_future().wait();
        left = true;
    });
    std::thread canceller([&] { flag.cancel(); });
    entered.get_future().wait();
    auto taken = std::async(std::launch::async, [&] {
        flag.setHandler(nullptr);
        return left.load();
    });
    leave.set_value();
    EXPECT_TRUE(taken.get());
    canceller.join();
}

} // namespace
