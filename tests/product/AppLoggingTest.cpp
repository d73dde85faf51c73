#include "app/VXLogging.h"
#include "platform/base/Log.h"
#include "platform/base/OperationQueue.h"
#include "platform/base/Process.h"
#include "platform/system/NotifyService.h"
#include "platform/system/PreferencesStore.h"
#include "tests/product/ProductFixture.h"

#include <thread>

using namespace tavrin;
using platform::JotRecord;
using testing::Contains;
using testing::Each;
using testing::ElementsAre;
using testing::EndsWith;
using testing::IsEmpty;
using testing::Not;
using testing::Pair;

namespace test {
namespace {

constexpr const char* quotaVariable = "JOT_QUOTA_DISABLED";

struct Logging : HouseTest {
    Logging() {
        adjustParts = [this, usual = adjustParts](platform::PlatformParts& parts) {
            usual(parts);
            parts.markerExists = [this](const std::string& path) {
                return marked && path == "/etc/vx_hella_logging";
            };
        };
        withoutAccount();
        VXSetLogLevel(vxInfo);
    }
    ~Logging() override {
        CapturingJot::refuseRecords(false);
        platform::setLogSink({});
        platform::setEnvironmentVariable(quotaVariable, std::nullopt);
    }
    /// The one record that `say` leads to.
    static JotRecord recordOf(const std::function<void()>& say) {
        clearLog();
        say();
        const std::vector<JotRecord> records = logRecords();
        EXPECT_EQ(records.size(), 1U);
        return records.empty() ? JotRecord() : records.front();
    }
    static void say(int level, unsigned line = 42) {
        VXLog("items/Here.cpp", "void here()", line, "VX", level, "%@ of %d", "two", 3);
    }
    /// What the console gets while `action` runs and its records are dealt with.
    static std::string consoleOf(const std::function<void()>& action) {
        testing::internal::CaptureStderr();
        action();
        VXJotClient::JotClient()->logQueue()->sync([] {});
        return testing::internal::GetCapturedStderr();
    }
    bool marked = false;
};

TEST_F(Logging, tellsAllOfAMessageInTheOrderOfItsKeys) {
    clock->advance(1'250'999ns);
    platform::WorkQueue errands("com.example.errands");
    const JotRecord record = recordOf([&] {
        const auto extras =
            std::make_shared<const VXExtras>(VXExtras{{"item", "ä"}, {"batch", "7"}});
        const int three = 3;
        const std::array arguments{platform::makeFormatArgument(three)};
        errands.sync([&] {
            VXLogv("items/Here.cpp", "void here()", 42, "VX", 4, extras, "all %d", arguments);
        });
    });
    EXPECT_THAT(record.fields(),
                ElementsAre(Pair("Time", "1700000000"), Pair("TimeNanoSec", "1250000"),
                            Pair("Level", "4"), Pair("Facility", "com.pelmora.Tavrin"),
                            Pair("PID", std::to_string(platform::processIdentifier())),
                            Pair("Host", platform::hostName().value_or("UnknownHost")),
                            Pair("Message", "all 3"), Pair("Source", "items/Here.cpp"),
                            Pair("Line", "42"), Pair("Function", "void here()"),
                            Pair("VXFacility", "VX"), Pair("VXLogToFile", "1"),
                            Pair("Thread", "com.example.errands"), Pair("batch", "7"),
                            Pair("item", "ä")));
    EXPECT_EQ(CapturingJot::lastFacility(), "com.pelmora.Tavrin");
}

TEST_F(Logging, leavesOutWhatThereIsNot) {
    EXPECT_THAT(recordOf([] { say(6); }).fields(), Contains(Pair("Thread", "main")));
    EXPECT_THAT(recordOf([] { say(6, 0); }).fields(), Not(Contains(testing::Key("Line"))));
    EXPECT_THAT(recordOf([] { std::thread([] { say(6); }).join(); }).fields(),
                Not(Contains(testing::Key("Thread"))));
    clock->setPreciseTimeAvailable(false);
    const JotRecord coarse = recordOf([] { say(6); });
    EXPECT_THAT(coarse.fields(), Contains(Pair("Time", "1700000000")));
    EXPECT_THAT(coarse.fields(), Not(Contains(testing::Key("TimeNanoSec"))));
    VXSetLogLevel(5);
    EXPECT_THAT(recordOf([] { say(3); }).fields(), Not(Contains(testing::Key("VXLogToFile"))));
}

TEST_F(Logging, writesALevelOutsideTheScaleAsNine) {
    VXSetLogLevel(12);
    for (const auto& [level, text] : {std::pair(-1, "9"), std::pair(0, "0"), std::pair(7, "7"),
                                      std::pair(8, "9"), std::pair(12, "9")})
        EXPECT_EQ(valueOf(recordOf([level = level] { say(level); }), "Level"), text) << level;
}

struct Witness {
    int* descriptions;
};
void appendDescription(std::string& out, const Witness& witness) {
    out += "seen " + std::to_string(++*witness.descriptions);
}

TEST_F(Logging, neitherFormatsNorEvaluatesWhatItDrops) {
    int descriptions = 0;
    int evaluations = 0;
    const auto witness = [&] {
        ++evaluations;
        return Witness{&descriptions};
    };
    VXLOG(vxDebug, "%@", witness());
    VXLog(__FILE__, __func__, __LINE__, "VX", vxDebug, "%@", Witness{&descriptions});
    EXPECT_EQ(evaluations + descriptions, 0);
    EXPECT_THAT(logRecords(), IsEmpty());
    VXLOG(vxInfo, "%@", witness());
    EXPECT_THAT(logLines(), ElementsAre("6 seen 1"));
    EXPECT_EQ(evaluations, 1);
}

TEST_F(Logging, takesTheThresholdFromPreferenceAndMarker) {
    struct Case {
        platform::Value preference;
        bool marked;
        int level;
        std::uint32_t filter;
    };
    const std::int64_t huge = std::int64_t{1} << 40;
    for (const Case& each :
         {Case{{}, false, 6, 0x7F}, Case{2, false, 6, 0x7F}, Case{-4, false, 6, 0x7F},
          Case{3, false, 3, 0x0F}, Case{7, false, 7, 0xFF}, Case{9, false, 9, 0xFF},
          Case{huge, false, INT_MAX, 0xFF}, Case{"7", false, 6, 0x7F}, Case{3, true, 8, 0xFF},
          Case{{}, true, 8, 0xFF}}) {
        platform->standardPreferences().setValue("VXLogLevel", each.preference);
        marked = each.marked;
        const auto client = VXJotClient::create();
        EXPECT_EQ(client->logLevel(), each.level);
        EXPECT_EQ(client->logLevelForJot(), std::min(each.level, 7));
        EXPECT_EQ(CapturingJot::filter(), each.filter) << each.level;
        EXPECT_EQ(platform::environmentVariable(quotaVariable),
                  each.level >= 8 ? std::optional<std::string>("1") : std::nullopt);
    }
}

TEST_F(Logging, saysOnceAnEvaluationThatItIsNotThrottled) {
    VXSetLogLevel(vxDebug);
    marked = true;
    const auto first = VXJotClient::create();
    const auto second = VXJotClient::create();
    marked = false;
    const auto third = VXJotClient::create();
    platform::OperationQueue::global().waitUntilIdle();
    EXPECT_THAT(logLines(), ElementsAre("7 Unthrottling logging", "7 Unthrottling logging"));
    EXPECT_EQ(platform::environmentVariable(quotaVariable), std::nullopt);
}

TEST_F(Logging, changesTheThresholdAtOnceAndNothingElse) {
    platform::setEnvironmentVariable(quotaVariable, "1");
    VXSetLogLevel(vxDebug);
    say(7);
    EXPECT_EQ(CapturingJot::filter(), 0xFFU);
    VXSetLogLevel(3);
    say(4);
    say(3);
    EXPECT_EQ(CapturingJot::filter(), 0x0FU);
    VXSetLogLevel(-1);
    say(0);
    EXPECT_EQ(CapturingJot::filter(), 0U);
    VXSetLogLevel(20);
    EXPECT_EQ(VXJotLogLevel(), 7);
    EXPECT_EQ(VXJotClient::JotClient()->logLevel(), 20);
    EXPECT_THAT(logLines(), ElementsAre("7 two of 3", "3 two of 3"));
    EXPECT_EQ(platform::environmentVariable(quotaVariable), "1");
}

TEST_F(Logging, keepsTheOrderOfEachThread) {
    constexpr int messages = 300;
    std::vector<std::thread> threads;
    for (int thread = 0; thread < 3; ++thread)
        threads.emplace_back([thread] {
            for (int i = 0; i < messages; ++i)
                VXLog("a.cpp", "f", static_cast<unsigned>(i + 1), "VX", thread, "%d", i);
        });
    for (std::thread& each : threads)
        each.join();
    std::array<int, 3> next{};
    for (const JotRecord& record : logRecords()) {
        int& expected = next.at(static_cast<std::size_t>(std::stoi(valueOf(record, "Level"))));
        EXPECT_EQ(valueOf(record, "Message"), std::to_string(expected++));
    }
    EXPECT_THAT(next, Each(messages));
}

TEST_F(Logging, echoesToTheConsoleAlsoWhereNothingCanBeSent) {
    const auto echo = [] { return consoleOf([] { say(4); }); };
    EXPECT_THAT(echo(), EndsWith(": two of 3\n"));
    EXPECT_EQ(logRecords().size(), 1U);
    CapturingJot::refuseRecords(true);
    EXPECT_THAT(echo(), EndsWith(": two of 3\n"));
    EXPECT_EQ(logRecords().size(), 1U);
    EXPECT_THAT(consoleOf([] { say(7); }), IsEmpty());
    platform.reset();
    EXPECT_THAT(echo(), EndsWith(": two of 3\n")) << "the services have gone";
}

TEST_F(Logging, bringsThePlatformsOwnMessagesWithTheirPlace) {
    connectPlatformLog();
    const JotRecord record = recordOf([] {
        platformLog(platform::LogLevel::debug, "not wanted");
        platformLog(platform::LogLevel::error, "100%% of %@", "%@");
    });
    EXPECT_EQ(valueOf(record, "Level"), "3");
    EXPECT_EQ(valueOf(record, "Message"), "100% of %@");
    EXPECT_THAT(valueOf(record, "Source"), EndsWith("AppLoggingTest.cpp"));
    EXPECT_NE(valueOf(record, "Line"), "");
}

TEST(LogThreshold, followsTheAdministratorsSettings) {
    expectInFreshProcess([] {
        ProductHouse house;
        house.withoutAccount();
        EXPECT_EQ(VXJotLogLevel(), 6);
        house.home.write("managed-settings.json", R"({"VXLogLevel": 4})");
        // Heard after the log's own client, which has been there before.
        const auto token = house.platform->notify().observe(platform::managedSettingsChangedNotice,
                                                            house.platform->mainQueue(), [] {});
        house.platform->notify().post(platform::managedSettingsChangedNotice);
        EXPECT_TRUE(house.until([] {
            VXJotClient::JotClient()->logQueue()->sync([] {});
            return VXJotLogLevel() == 4;
        }));
    });
}

} // namespace
} // namespace test
