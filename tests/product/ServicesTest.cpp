#include "app/VXLogging.h"
#include "platform/system/NetworkActivityIndicator.h"
#include "platform/system/ReachabilityService.h"
#include "platform/ui/Application.h"
#include "services/NetworkIndicator.h"
#include "services/NetworkWatcher.h"
#include "services/QuotaFetcher.h"
#include "tests/product/ProductFixture.h"

#include <filesystem>
#include <thread>

using tavrin::NetworkIndicator;
using tavrin::NetworkWatcher;
using tavrin::QuotaFetcher;
using testing::Each;
using testing::ElementsAre;
using testing::IsEmpty;

namespace test {
namespace {

/// A network whose targets say what the test says, at once, on their queue; and that may fail.
struct PlayedNetwork : platform::ReachabilityService {
    struct Target : platform::ReachabilityTarget {
        explicit Target(PlayedNetwork& network) : network_(network) { ++network_.living; }
        ~Target() override { --network_.living; }
        bool setCallback(Callback callback) override {
            network_.callback = std::move(callback);
            return network_.takesCallback;
        }
        bool setQueue(std::shared_ptr<platform::WorkQueue> queue) override {
            network_.queue = std::move(queue);
            return network_.takesQueue;
        }
        PlayedNetwork& network_;
    };
    std::unique_ptr<platform::ReachabilityTarget> createTarget(const std::string& host) override {
        hosts.push_back(host);
        return makesTargets ? std::make_unique<Target>(*this) : nullptr;
    }
    void report(std::uint32_t flags) const {
        queue->sync([&] { callback(flags); });
    }

    bool makesTargets = true;
    bool takesCallback = true;
    bool takesQueue = true;
    int living = 0;
    std::vector<std::string> hosts;
    platform::ReachabilityTarget::Callback callback;
    std::shared_ptr<platform::WorkQueue> queue;
};

struct Watching : HouseTest {
    Watching() {
        adjustParts = [this, usual = adjustParts](platform::PlatformParts& parts) {
            usual(parts);
            auto played = std::make_unique<PlayedNetwork>();
            network = played.get();
            parts.reachability = std::move(played);
        };
        withoutAccount();
        tavrin::VXSetLogLevel(tavrin::vxInfo);
        // The store's own target, made before.
        network->hosts.clear();
        network->living = 0;
    }
    PlayedNetwork* network = nullptr;
};

TEST_F(Watching, readsTheStateFromTwoBits) {
    NetworkWatcher watcher;
    EXPECT_EQ(watcher.networkState(), 0U);
    EXPECT_FALSE(watcher.isConnected());
    watcher.start();
    EXPECT_EQ(watcher.networkState(), 0U) << "until the first report";
    struct Case {
        std::uint32_t flags, state;
        bool connected;
    };
    for (const Case& each :
         {Case{0x0, 1, false}, Case{0x2, 2, true}, Case{0x40002, 3, true}, Case{0x40000, 1, false},
          Case{0x6, 2, true}, Case{0xFFFFFFFF, 3, true}, Case{0xFFFBFFFD, 1, false}}) {
        network->report(each.flags);
        EXPECT_EQ(watcher.networkState(), each.state) << each.flags;
        EXPECT_EQ(watcher.isConnected(), each.connected) << each.flags;
        EXPECT_EQ(watcher.reachabilityFlags(), each.flags);
    }
    EXPECT_EQ(network->queue->label(), "com.pelmora.Tavrin.networkwatcher");
}

TEST_F(Watching, tellsEveryReportAndEachChangeOnce) {
    NetworkWatcher watcher;
    watcher.start();
    for (const std::uint32_t flags : {0x2U, 0x6U, 0x40002U, 0x0U, 0x40000U})
        network->report(flags);
    EXPECT_THAT(logLines(), ElementsAre("6 Network reachability flags changed to 0x2",
                                        "6 Network state changed to connected to Wi-Fi",
                                        "6 Network reachability flags changed to 0x6",
                                        "6 Network reachability flags changed to 0x40002",
                                        "6 Network state changed to connected to cellular",
                                        "6 Network reachability flags changed to 0x0",
                                        "6 Network state changed to not connected",
                                        "6 Network reachability flags changed to 0x40000"));
    EXPECT_EQ(NetworkWatcher::_descriptionForNetworkState(0), "unknown");
    EXPECT_EQ(NetworkWatcher::_descriptionForNetworkState(7), "??? (7)");
}

TEST_F(Watching, attachesOnceAndForgetsWhenStopped) {
    NetworkWatcher watcher;
    watcher.start();
    watcher.start();
    EXPECT_EQ(network->hosts.size(), 1U);
    network->report(0x2);
    clearLog();
    watcher.stop();
    EXPECT_EQ(watcher.networkState(), 0U);
    EXPECT_EQ(watcher.reachabilityFlags(), 0U);
    EXPECT_EQ(network->living, 0);
    EXPECT_EQ(network->callback, nullptr);
    EXPECT_EQ(network->queue, nullptr);
    EXPECT_THAT(logRecords(), IsEmpty());
    watcher.start();
    EXPECT_EQ(network->living, 1);
}

TEST_F(Watching, isNotConnectedWhereItCannotWatch) {
    NetworkWatcher watcher;
    network->makesTargets = false;
    watcher.start();
    EXPECT_EQ(watcher.networkState(), 1U);
    watcher.start();
    EXPECT_EQ(network->hosts.size(), 2U) << "tries again";
    EXPECT_THAT(logLines(), ElementsAre("3 Couldn't create reachability object",
                                        "6 Network state changed to not connected",
                                        "3 Couldn't create reachability object"));
    network->makesTargets = true;
    for (bool* const step : {&network->takesCallback, &network->takesQueue}) {
        *step = false;
        clearLog();
        NetworkWatcher other;
        other.start();
        EXPECT_EQ(other.networkState(), 1U);
        EXPECT_EQ(network->living, 1) << "keeps its target";
        EXPECT_TRUE(logged("3 Couldn't set reachability callback or queue"));
        *step = true;
    }
}

struct Indicating : HouseTest {
    Indicating() { withoutAccount(); }
    bool isOn() const { return platform->networkActivityIndicator().isVisible(); }
    NetworkIndicator indicator;
};

TEST_F(Indicating, isOnWhileAnyActivityRuns) {
    indicator.hide("never shown");
    EXPECT_FALSE(isOn());
    indicator.show("a");
    indicator.show("a");
    EXPECT_TRUE(isOn());
    indicator.hide("b");
    EXPECT_TRUE(isOn());
    indicator.show("b");
    indicator.hide("a");
    EXPECT_TRUE(isOn());
    indicator.hide("b");
    EXPECT_FALSE(isOn());
    platform->networkActivityIndicator().setVisible(true);
    indicator.hide("b");
    EXPECT_TRUE(isOn()) << "an absent activity switches nothing";
}

TEST_F(Indicating, countsActivitiesOfManyThreads) {
    std::vector<std::thread> threads;
    for (int thread = 0; thread < 4; ++thread)
        threads.emplace_back([this, id = std::to_string(thread)] {
            for (int i = 0; i < 500; ++i) {
                indicator.show(id);
                EXPECT_TRUE(isOn());
                indicator.hide(id);
            }
            if (id == "3")
                indicator.show("left");
        });
    for (std::thread& each : threads)
        each.join();
    EXPECT_TRUE(isOn());
    indicator.hide("left");
    EXPECT_FALSE(isOn());
}

struct Listener : tavrin::QuotaFetcherDelegate {
    void quotaFetcherDidUpdateValue(QuotaFetcher& fetcher, std::uint64_t bytes) override {
        EXPECT_TRUE(platform::Platform::current().mainQueue().isMainThread());
        EXPECT_EQ(fetcher.freeBytes(), bytes);
        heard.push_back(bytes);
    }
    std::vector<std::uint64_t> heard;
};

struct Quota : HouseTest {
    Quota() {
        quota = 1'000'000;
        givenRemote("Big.bin", std::string(400'000, 'b'));
    }
    void givenFetcher(double seconds = 300) {
        signIn();
        NetworkWatcher::sharedNetworkWatcher()->start();
        givenState("wifi", tavrin::networkWiFi);
        listenClosely();
        clearLog();
        fetcher = QuotaFetcher::create();
        fetcher->setDelegate(listener);
        fetcher->runWithInterval(seconds);
    }
    void givenState(const std::string& script, std::uint32_t state) {
        givenNetwork(script);
        ASSERT_TRUE(untilElsewhere(
            [&] { return NetworkWatcher::sharedNetworkWatcher()->networkState() == state; }));
    }
    void advance(platform::Duration time) {
        clock->advance(time);
        fetcher->queue()->sync([] {});
    }
    bool untilHeard(std::size_t count) {
        return until([&] { return listener->heard.size() >= count; });
    }
    long refusals() const {
        const std::vector<std::string> lines = logLines();
        return std::ranges::count(lines, "7 Not fetching quota. Background or offline");
    }
    void post(std::string_view name) const { platform->notifications().post(name); }

    std::shared_ptr<QuotaFetcher> fetcher;
    const std::shared_ptr<Listener> listener = std::make_shared<Listener>();
};

TEST_F(Quota, isAskedForAtOnceAndEveryInterval) {
    givenFetcher();
    EXPECT_EQ(fetcher->freeBytes(), 0U);
    advance(0s);
    ASSERT_TRUE(untilHeard(1));
    EXPECT_THAT(listener->heard, ElementsAre(600'000U));
    advance(299s);
    advance(1s);
    ASSERT_TRUE(untilHeard(2));
    advance(300s);
    ASSERT_TRUE(untilHeard(3));
    EXPECT_THAT(listener->heard, Each(600'000U));
    EXPECT_EQ(fetcher->queue()->label(), "com.pelmora.Tavrin.quotafetcher");
}

TEST_F(Quota, hasOneTimerAtTheNewestInterval) {
    givenFetcher(10);
    advance(0s);
    ASSERT_TRUE(untilHeard(1));
    post(platform::applicationWillResignActiveNotification); // each tick says now that it does
                                                             // nothing
    fetcher->runWithInterval(100);
    advance(0s);
    EXPECT_EQ(refusals(), 1) << "at once";
    for (int i = 0; i < 9; ++i)
        advance(10s);
    EXPECT_EQ(refusals(), 1);
    for (int i = 0; i < 11; ++i)
        advance(10s);
    EXPECT_EQ(refusals(), 3);
}

TEST_F(Quota, restsInTheBackgroundUntilTheNextTick) {
    givenFetcher();
    advance(0s);
    ASSERT_TRUE(untilHeard(1));
    post(platform::applicationWillResignActiveNotification);
    EXPECT_TRUE(logged("6 ApplicationWillResignActiveNotification (quota)"));
    EXPECT_FALSE(fetcher->canFetch());
    advance(300s);
    EXPECT_EQ(refusals(), 1);
    post(platform::applicationDidBecomeActiveNotification);
    EXPECT_TRUE(logged("6 ApplicationDidBecomeActiveNotification (quota)"));
    advance(299s);
    platform->mainQueue().drainAll();
    EXPECT_EQ(listener->heard.size(), 1U) << "becoming active asks nothing by itself";
    advance(1s);
    EXPECT_TRUE(untilHeard(2));
}

TEST_F(Quota, restsWhileThereIsNoNetwork) {
    givenFetcher();
    advance(0s);
    ASSERT_TRUE(untilHeard(1));
    givenState("offline", tavrin::networkNotConnected);
    advance(300s);
    EXPECT_EQ(refusals(), 1);
    NetworkWatcher::sharedNetworkWatcher()->stop();
    advance(300s);
    EXPECT_EQ(refusals(), 2) << "an unknown network is none";
    NetworkWatcher::sharedNetworkWatcher()->start();
    givenState("cellular", tavrin::networkCellular);
    advance(300s);
    EXPECT_TRUE(untilHeard(2));
}

TEST_F(Quota, keepsItsLastValueWhenTheAccountCannotBeRead) {
    givenFetcher();
    advance(0s);
    ASSERT_TRUE(untilHeard(1));
    std::filesystem::rename(remote, home / "unplugged");
    advance(300s);
    ASSERT_TRUE(untilElsewhere([] {
        const std::vector<std::string> lines = logLines();
        return std::ranges::any_of(
            lines, [](const auto& line) { return line.starts_with("4 can't update quota: "); });
    }));
    EXPECT_EQ(fetcher->freeBytes(), 600'000U);
    EXPECT_EQ(listener->heard.size(), 1U);
}

TEST_F(Quota, isToldAlsoWhenNothingIsLeft) {
    quota = 100;
    givenFetcher();
    advance(0s);
    ASSERT_TRUE(untilHeard(1));
    EXPECT_THAT(listener->heard, ElementsAre(0U));
}

TEST_F(Quota, endsWithItsFetcher) {
    givenFetcher();
    advance(0s);
    const std::shared_ptr<platform::WorkQueue> queue = fetcher->queue();
    const std::weak_ptr<QuotaFetcher> gone = fetcher;
    fetcher.reset(); // an answer may be on its way
    platform->mainQueue().drainAll();
    EXPECT_TRUE(gone.expired());
    clearLog();
    listener->heard.clear();
    clock->advance(600s);
    queue->sync([] {});
    post(platform::applicationDidBecomeActiveNotification);
    platform->mainQueue().drainAll();
    EXPECT_THAT(logRecords(), IsEmpty());
    EXPECT_THAT(listener->heard, IsEmpty());
}

} // namespace
} // namespace test
