#include "platform/base/MainQueue.h"
#include "platform/base/ManualClock.h"
#include "platform/base/OperationQueue.h"
#include "platform/base/TimerSource.h"
#include "platform/base/WorkQueue.h"

#include <gtest/gtest.h>

#include <future>

using namespace std::chrono_literals;
using platform::ManualClock;
using platform::WorkQueue;

namespace {

struct Time : ::testing::Test {
    ManualClock clock;
    platform::MainQueue main{clock};
    std::string log;

    void advance(platform::Duration step) {
        clock.advance(step, [this] { main.drainAll(); });
    }
};

TEST_F(Time, DelayedJobsRunInOrderOfTheirMoments) {
    main.after(2s, [&] { log += "b"; });
    main.after(1s, [&] {
        log += "a";
        main.after(500ms, [&] { log += "x"; }); // set within the step, due within it
    });
    advance(999ms);
    EXPECT_EQ(log, "");
    advance(2s);
    EXPECT_EQ(log, "axb");
}

TEST_F(Time, ACancelledTimerStaysSilentEvenWhenItsJobWaits) {
    platform::Timer timer = main.timer(1s, [&] { log += "fired"; });
    clock.advance(1s); // the job waits in the main queue
    timer.cancel();
    main.drainAll();
    EXPECT_EQ(log, "");
    EXPECT_FALSE(timer);
}

TEST_F(Time, RepeatingTimerSkipsWhatItMissed) {
    platform::TimerSource source(clock, main);
    source.schedule(0s, 300s);
    source.setHandler([&] { log += "t"; });
    advance(1s);
    EXPECT_EQ(log, "") << "suspended until resumed";
    source.resume();
    advance(600s);
    EXPECT_EQ(log, "ttt");
    source.cancel();
    advance(600s);
    EXPECT_EQ(log, "ttt");
}

TEST_F(Time, WallClockJumpsLeaveTimersAlone) {
    const auto before = clock.now();
    main.after(10s, [&] { log += "a"; });
    clock.jumpWallClock(3600s);
    main.drainAll();
    EXPECT_EQ(log, "");
    EXPECT_EQ(clock.now().secondsSince(before), 3600);
}

TEST(WorkQueue, RunsInOrderAndKnowsItsLabel) {
    WorkQueue queue("com.example.queue");
    std::vector<int> order;
    for (int i = 0; i < 1000; ++i)
        queue.async([&order, i] { order.push_back(i); });
    std::string label;
    queue.sync([&] { label = WorkQueue::currentLabel(); });
    EXPECT_TRUE(std::is_sorted(order.begin(), order.end()));
    EXPECT_EQ(order.size(), 1000U);
    EXPECT_EQ(label, "com.example.queue");
    queue.sync([&] { queue.sync([&] { label = "nested"; }); });
    EXPECT_EQ(label, "nested");
}

TEST(WorkQueue, ALastReferenceDroppedByItsOwnJobIsNoDeadlock) {
    std::promise<void> destroyed;
    auto queue = std::make_shared<WorkQueue>("self");
    WorkQueue* raw = queue.get();
    raw->async([queue = std::move(queue), &destroyed]() mutable {
        queue.reset();
        destroyed.set_value();
    });
    destroyed.get_future().get();
}

TEST(OperationQueue, RunsSeveralAtOnce) {
    platform::OperationQueue queue("pair", 2);
    std::promise<void> first;
    std::promise<void> second;
    // Each waits for the other: a serial queue would never finish.
    queue.async([&] { first.set_value(), second.get_future().wait(); });
    queue.async([&] { second.set_value(), first.get_future().wait(); });
    queue.waitUntilIdle();
}

} // namespace
