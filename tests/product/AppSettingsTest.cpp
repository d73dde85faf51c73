#include "app/Settings.h"
#include "platform/base/Identity.h"
#include "platform/system/PreferencesFile.h"
#include "platform/system/PreferencesStore.h"
#include "tests/product/ProductFixture.h"

#include <filesystem>

using tavrin::Settings;

namespace test {
namespace {

struct Preferences : HouseTest {
    Preferences() {
        withoutAccount();
        listenClosely();
    }
    platform::PreferencesDomain domain() const {
        return {std::string(platform::applicationIdentifier), platform::PreferencesUser::current,
                platform::PreferencesHost::any, Settings::_appContainerPath()};
    }
    /// As another process of the user's has it.
    platform::Value elsewhere(std::string_view key) const {
        return platform::makeFilePreferences(config, "")->value(domain(), key);
    }
    void setElsewhere(std::string_view key, const platform::Value& value) const {
        const auto store = platform::makeFilePreferences(config, "");
        store->setValue(domain(), key, value);
        EXPECT_TRUE(store->synchronize(domain()));
    }
    const std::string config = home / "config";
};

TEST_F(Preferences, showListsUntilTheGridIsChosen) {
    EXPECT_FALSE(Settings::gridMode());
    EXPECT_TRUE(logged("7 GridMode = 0"));
    Settings::setGridMode(true);
    EXPECT_TRUE(Settings::gridMode());
    EXPECT_TRUE(logged("7 GridMode = 1"));
    EXPECT_EQ(elsewhere("GridMode").boolean(), true);
}

TEST_F(Preferences, followWhatAnotherProcessWrites) {
    Settings::setGridMode(true);
    setElsewhere("GridMode", false);
    EXPECT_FALSE(Settings::gridMode());
    setElsewhere("GridMode", 1);
    EXPECT_TRUE(Settings::gridMode());
    setElsewhere("GridMode", {});
    EXPECT_TRUE(Settings::boolPrefForKey("GridMode", true)) << "the default where there is none";
}

TEST_F(Preferences, keepQuickLaunchOnWhateverIsStored) {
    Settings::setQuickLaunch(false);
    EXPECT_TRUE(Settings::quickLaunch());
    EXPECT_TRUE(logged("7 set QuickLaunch = 0"));
    EXPECT_EQ(elsewhere("QuickLaunch").boolean(), false);
}

TEST_F(Preferences, sayThatTheyCannotBeWrittenAndKeepWhatWasSet) {
    const std::string file = platform::preferencesPath(config, domain());
    std::filesystem::create_directories(file);
    Settings::setGridMode(true);
    EXPECT_TRUE(logged("3 Failed to write prefs"));
    EXPECT_TRUE(Settings::gridMode());
    std::filesystem::remove(file);
    clearLog();
    Settings::setQuickLaunch(true);
    EXPECT_FALSE(logged("3 Failed to write prefs"));
    EXPECT_EQ(elsewhere("GridMode").boolean(), true) << "the write that failed is made up for";
}

} // namespace
} // namespace test
