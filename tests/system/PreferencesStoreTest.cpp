#include "platform/system/PreferencesStore.h"

#include "platform/base/Identity.h"
#include "platform/base/Log.h"

#include "tests/support/TemporaryFolder.h"

#include <gtest/gtest.h>

#include <cmath>
#include <filesystem>
#include <fstream>
#include <sys/wait.h>
#include <unistd.h>

namespace fs = std::filesystem;
using platform::Bytes;
using platform::Date;
using platform::PreferencesDomain;
using platform::PreferencesHost;
using platform::PreferencesStore;
using platform::PreferencesUser;
using platform::Url;
using platform::Value;

namespace {

struct Preferences : ::testing::Test {
    test::TemporaryFolder folder;
    const PreferencesDomain domain{"com.example.app", PreferencesUser::current,
                                   PreferencesHost::any, "/data/container"};

    std::unique_ptr<PreferencesStore> givenProcess() const {
        return platform::makeFilePreferences(folder / "config", folder / "managed.json");
    }
    std::vector<std::string> files() const {
        std::vector<std::string> out;
        for (const auto& entry : fs::recursive_directory_iterator(folder / "config"))
            if (entry.is_regular_file() && entry.path().extension() != ".lock")
                out.push_back(entry.path().string());
        std::sort(out.begin(), out.end());
        return out;
    }
};

Value::Map valuesOfEveryKind() {
    return {{"none in list", Value::List{Value(), Value(1)}},
            {"flag", true},
            {"whole", std::int64_t{-9'007'199'254'740'993}},
            {"real", 3.0},
            {"fine", 0.1},
            {"endless", HUGE_VAL},
            {"text", "Grüße\n\"quoted\""},
            {"broken text", std::string("\xff\xc0\x80 caf\xe9")},
            {"$date", "a key that looks like ours"},
            {"bytes", Bytes{std::byte{0}, std::byte{0xfe}}},
            {"date", Date{-1'234'567'890'123}},
            {"url", Url::file("/a b/\xff", true)},
            {"empty url", Url()},
            {"map", Value::Map{{"$bytes", Value::Map{}}, {"\xff", Value::List{}}}}};
}

TEST_F(Preferences, EveryKindOfValueReadsBackAsItself) {
    const auto writer = givenProcess();
    for (const auto& [key, value] : valuesOfEveryKind())
        writer->setValue(domain, key, value);
    ASSERT_TRUE(writer->synchronize(domain));
    const auto reader = givenProcess();
    for (const auto& [key, value] : valuesOfEveryKind())
        EXPECT_EQ(reader->value(domain, key), value) << key;
    EXPECT_TRUE(std::isinf(*reader->value(domain, "endless").number()));
    EXPECT_TRUE(reader->value(domain, "absent").isNone());
}

TEST_F(Preferences, EachOfTheFourPartsMakesAnotherPlace) {
    std::vector<PreferencesDomain> domains(5, domain);
    domains[1].application = "../../com.example.app";
    domains[2].user = PreferencesUser::any;
    domains[3].host = PreferencesHost::current;
    domains[4].containerPath = "/data/other";
    const auto store = givenProcess();
    for (std::size_t i = 0; i < domains.size(); ++i) {
        store->setValue(domains[i], "key", static_cast<int>(i));
        EXPECT_TRUE(store->synchronize(domains[i]));
    }
    for (std::size_t i = 0; i < domains.size(); ++i)
        EXPECT_EQ(givenProcess()->value(domains[i], "key").integer(), i);
    EXPECT_EQ(files().size(), domains.size()) << "all below the folder";
    PreferencesDomain spelled = domain;
    spelled.containerPath = "/data/./container/";
    EXPECT_EQ(store->value(spelled, "key").integer(), 0);
}

TEST_F(Preferences, WritersOfDifferentKeysKeepEachOthersValues) {
    const auto first = givenProcess();
    const auto second = givenProcess();
    first->setValue(domain, "shared", 1);
    first->setValue(domain, "removed", 1);
    EXPECT_TRUE(first->synchronize(domain));
    second->setValue(domain, "shared", 2);
    second->setValue(domain, "removed", Value());
    EXPECT_TRUE(second->value(domain, "removed").isNone()) << "before it is written";
    EXPECT_TRUE(second->synchronize(domain));
    EXPECT_EQ(first->value(domain, "shared").integer(), 1) << "as it was read last";
    first->setValue(domain, "own", 3);
    EXPECT_TRUE(first->synchronize(domain));
    EXPECT_EQ(first->value(domain, "shared").integer(), 2);
    EXPECT_TRUE(first->value(domain, "removed").isNone());
}

TEST_F(Preferences, ManyProcessesLoseNothing) {
    constexpr int processes = 4;
    constexpr int rounds = 25;
    std::vector<pid_t> children;
    for (int p = 0; p < processes; ++p) {
        children.push_back(::fork());
        if (children.back() != 0)
            continue;
        const auto store = givenProcess();
        bool good = true;
        for (int i = 0; i < rounds; ++i) {
            store->setValue(domain, std::to_string(p) + "/" + std::to_string(i), i);
            good = store->synchronize(domain) && good;
        }
        ::_exit(good ? 0 : 1);
    }
    for (const pid_t child : children) {
        int status = -1;
        ::waitpid(child, &status, 0);
        EXPECT_EQ(status, 0);
    }
    const auto reader = givenProcess();
    for (int p = 0; p < processes; ++p)
        for (int i = 0; i < rounds; ++i)
            EXPECT_EQ(reader->value(domain, std::to_string(p) + "/" + std::to_string(i)).integer(),
                      i);
}

TEST_F(Preferences, ADamagedFileIsSetAsideAndWhatIsKnownIsKept) {
    const auto store = givenProcess();
    store->setValue(domain, "known", 1);
    ASSERT_TRUE(store->synchronize(domain));
    const std::string file = files().front();
    for (const char* garbage : {"", "{\"known\": 2", "[1]"}) {
        fs::remove(file);
        std::ofstream(file) << garbage;
        EXPECT_TRUE(store->synchronize(domain));
        EXPECT_EQ(store->value(domain, "known").integer(), 1);
        EXPECT_EQ(givenProcess()->value(domain, "known").integer(), 1);
    }
    EXPECT_EQ(files().size(), 4U) << "each damaged file is still there";
    EXPECT_TRUE(fs::exists(file + ".damaged"));
}

TEST_F(Preferences, WhatCannotBeWrittenIsKeptForTheNextTime) {
    folder.write("config", "a file where the folder should be");
    const auto store = givenProcess();
    store->setValue(domain, "key", "value");
    EXPECT_FALSE(store->synchronize(domain));
    EXPECT_EQ(*store->value(domain, "key").text(), "value");
    fs::remove(folder / "config");
    EXPECT_TRUE(store->synchronize(domain));
    EXPECT_EQ(*givenProcess()->value(domain, "key").text(), "value");
}

TEST_F(Preferences, AdministratorsValuesWinAndDamageLeavesTheLastGoodOnes) {
    const auto store = givenProcess();
    store->setValue(domain, "GridMode", false);
    EXPECT_TRUE(store->synchronize(domain));
    folder.write("managed.json", R"({"GridMode": true, "Limit": 7})");
    EXPECT_TRUE(store->synchronize(domain));
    EXPECT_EQ(store->value(domain, "GridMode").boolean(), true);
    store->setValue(domain, "GridMode", false);
    EXPECT_EQ(store->value(domain, "GridMode").boolean(), true) << "also over what is set now";
    folder.write("managed.json", "{");
    EXPECT_TRUE(store->synchronize(domain));
    EXPECT_EQ(store->value(domain, "Limit").integer(), 7);
    fs::remove(folder / "managed.json");
    EXPECT_TRUE(store->synchronize(domain));
    EXPECT_EQ(store->value(domain, "GridMode").boolean(), false);
    EXPECT_TRUE(store->value(domain, "Limit").isNone());
}

TEST_F(Preferences, StandardPreferencesAreWrittenAtOnceInTheApplicationsOwnDomain) {
    const auto store = givenProcess();
    platform::StandardPreferences preferences(*store);
    EXPECT_EQ(preferences.integer("VXLogLevel"), 0);
    preferences.setValue("VXLogLevel", 7.9);
    preferences.setValue("text", "7");
    const auto other = givenProcess();
    platform::StandardPreferences reader(*other);
    EXPECT_EQ(reader.integer("VXLogLevel"), 7);
    EXPECT_EQ(reader.integer("text"), 0);
    preferences.removeValue("VXLogLevel");
    EXPECT_TRUE(reader.synchronize());
    EXPECT_EQ(reader.integer("VXLogLevel"), 0);
    EXPECT_NE(files().front().find(platform::applicationIdentifier), std::string::npos);
}

} // namespace
