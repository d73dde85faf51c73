#include "items/VXItem.h"
#include "platform/base/Process.h"
#include "platform/cloud/CloudDocumentService.h"
#include "platform/cloud/CloudService.h"
#include "platform/system/NetworkActivityIndicator.h"
#include "platform/system/SourceApplications.h"
#include "preview/PreviewItemManager.h"
#include "services/NetworkIndicator.h"
#include "services/NetworkWatcher.h"
#include "tests/product/ProductFixture.h"

#include <filesystem>

using testing::Contains;
using testing::Not;
using testing::StartsWith;

namespace test {
namespace {

struct Entry : ProductTest {
    void givenStore() {
        givenRemote("My Notes/Milk 100%.txt", "two litres");
        signIn();
        launch();
    }
    static platform::OpenUrlOptions from(std::string_view caller) {
        return {{std::string(platform::sourceApplicationKey), std::string(caller)}};
    }
    bool request(const std::string& url) {
        const bool answer =
            application->openUrl(url, from(platform::homeScreenApplicationIdentifier));
        advance(1s);
        return answer;
    }
    /// The path of the document as an address has it, encoded as often as it is decoded.
    std::string address(std::string_view prefix = "tavrinapp://") const {
        const std::string once =
            platform::percentEncoded(url("My Notes/Milk 100%.txt").path(), "/");
        return std::string(prefix) + platform::percentEncoded(once, "/");
    }
    bool untilNetwork(const std::string& text) {
        return until([&] { return window().statusStrip().network == text; });
    }
};

TEST_F(Entry, readsTheModeFromTheQueryAlone) {
    givenStore();
    const std::vector<std::pair<std::string, int>> cases = {
        {address(), 0},
        {address() + "?mode=details", 1},
        {address() + "?mode=info", 1},
        {address() + "?mode=other", 0},
        {address() + "?Mode=details&x", 0},
        {address() + "?mode=Details", 0},
        {address() + "?mode=details&mode=preview", 0},
        {address() + "?mode=info&mode=bogus&mode", 1},
        {address() + "?%256Dode=de%2574ails", 1},
        {address() + "?mode=details%25zz", 0},
        {address("tavrinapp://details"), 0},
        {address("tavrinapp:") + "?a=b&mode=details#mode=preview", 1},
    };
    for (const auto& [url, mode] : cases) {
        EXPECT_TRUE(request(url)) << url;
        ASSERT_NE(nav().itemManager(), nullptr) << url;
        EXPECT_EQ(nav().itemManager()->mode(), mode) << url;
        EXPECT_EQ(nav().viewControllers().size(), 4U) << url;
    }
}

TEST_F(Entry, decodesThePathTwiceAndFollowsAPlaceholder) {
    givenRemote("A Day.txt");
    givenStore();
    const std::string folder = "tavrinapp://" + path("");
    EXPECT_TRUE(request(folder + "/A%20Day.txt?mode=details"));
    EXPECT_EQ(nav().itemManager()->item()->url(), url("A Day.txt"));
    EXPECT_TRUE(request(folder + "/A%2520Day.txt?mode=details"));
    EXPECT_EQ(nav().itemManager()->item()->url(), url("A Day.txt"));
    const std::optional<platform::Url> placeholder = documents().physicalURL(url("A Day.txt"));
    ASSERT_NE(placeholder, url("A Day.txt"));
    EXPECT_TRUE(request("tavrinapp://" + platform::percentEncoded(placeholder->path(), "/")));
    EXPECT_EQ(nav().itemManager()->item()->url(), url("A Day.txt"));
}

TEST_F(Entry, refusesWhatItCannotShow) {
    givenStore();
    const std::string root = path("/");
    for (const std::string& url :
         {std::string(), std::string("no address"), std::string("tavrinapp:"),
          std::string("tavrinapp://"), std::string("tavrinapp:Milk.txt"),
          std::string("tavrinapp:///"), address("TAVRINAPP://"), address("tavrinapps://"),
          address() + "%25", address() + "%25zz", address() + "%2500x", address() + "%zz",
          "tavrinapp://" + root + "/Documents/%252E%252E/%252E%252E/state.db",
          "tavrinapp://" + root + "/Documents/../../state.db", "tavrinapp://" + home.path()}) {
        EXPECT_FALSE(request(url)) << url;
        EXPECT_EQ(titles(), std::vector<std::string>{"Tavrin"}) << url;
    }
    EXPECT_THAT(logLines(), Not(Contains(StartsWith("4 Ignoring"))));
}

TEST_F(Entry, isForTheHomeScreenAndTheTestRunnerAlone) {
    givenStore();
    const std::string runner(platform::testRunnerApplicationIdentifier);
    EXPECT_FALSE(application->openUrl(address(), {}));
    EXPECT_TRUE(logged("4 Ignoring openURL launch from unknown source: (null)"));
    EXPECT_FALSE(
        application->openUrl(address(), {{std::string(platform::sourceApplicationKey), 7}}));
    EXPECT_FALSE(application->openUrl(address(), from(runner + ".x")));
    EXPECT_TRUE(logged("4 Ignoring openURL launch from unknown source: " + runner + ".x"));
    EXPECT_EQ(nav().viewControllers().size(), 1U);
    EXPECT_TRUE(application->openUrl(address(), from(runner)));
    EXPECT_THAT(logLines(), Contains(StartsWith("6 openURL: " + address() + ", options ")));
}

TEST_F(Entry, keepsItsStateWhileSomebodyIsSignedIn) {
    givenStore();
    EXPECT_EQ(nav().restorationIdentifier(), "Root");
    EXPECT_TRUE(untilElsewhere(
        [] { return tavrin::NetworkWatcher::sharedNetworkWatcher()->isConnected(); }));
    EXPECT_TRUE(delegate->applicationShouldSaveApplicationState(*application));
    EXPECT_TRUE(delegate->applicationShouldRestoreApplicationState(*application));
    signOut();
    EXPECT_FALSE(delegate->applicationShouldSaveApplicationState(*application));
    EXPECT_FALSE(delegate->applicationShouldRestoreApplicationState(*application));
}

TEST_F(Entry, comesBackAfterAKillWithWhatTheLastAddressOpened) {
    signIn();
    launch();
    const std::string prefix = "tavrinapp:";
    ASSERT_TRUE(request(prefix + givenFile("First.txt")));
    advance(3s);
    // The same screen shows it, over lists of its own.
    ASSERT_TRUE(request(prefix + givenFile("Second.txt")));
    advance(3s);
    relaunch();
    ASSERT_NE(nav().itemManager(), nullptr);
    EXPECT_EQ(nav().itemManager()->item()->url(), url("Second.txt"));
}

TEST_F(Entry, showsAccountNetworkAndActivityInTheStrip) {
    launch();
    EXPECT_EQ(window().statusStrip().account, "Not signed in");
    calmDown();
    EXPECT_EQ(window().statusStrip().network, "") << "of no interest without an account";
    signInAs("anna", "hers");
    EXPECT_EQ(window().statusStrip().account, "anna");
    EXPECT_TRUE(untilNetwork("Wi-Fi"));
    givenNetwork("cellular");
    EXPECT_TRUE(untilNetwork("Cellular"));
    givenNetwork("offline");
    EXPECT_TRUE(untilNetwork("Offline"));
    const auto indicator = tavrin::NetworkIndicator::sharedNetworkIndicator();
    indicator->show("copying");
    EXPECT_TRUE(until([&] { return window().statusStrip().activity; }));
    indicator->hide("copying");
    EXPECT_TRUE(until([&] { return !window().statusStrip().activity; }));
}

TEST_F(Entry, asksWhatItMeansThatMuchHasVanished) {
    const std::vector<std::string> names = {"One.txt", "Two.txt", "Three.txt"};
    for (const std::string& name : names)
        givenRemote("My Notes/" + name, name);
    givenStore();
    const auto inTime = [&](const std::function<bool()>& holds) {
        return untilElsewhere([&] {
            advance(50ms);
            return holds();
        });
    };
    ASSERT_TRUE(inTime([&] { return documents().isPromised(url("My Notes/Two.txt")); }));
    for (const auto& entry : std::filesystem::directory_iterator(url("My Notes").path()))
        std::filesystem::remove_all(entry.path());
    const auto isAsked = [&] { return alertText().starts_with("Delete or Bring Back?: 4 items"); };
    ASSERT_TRUE(inTime(isAsked));
    tap(*button("Decide Later"));
    advance(1s);
    EXPECT_EQ(alertText(), "") << "until the program becomes active again";
    application->setActive(false);
    application->setActive(true);
    ASSERT_TRUE(inTime(isAsked));
    tap(*button("Bring Them Back"));
    EXPECT_TRUE(inTime([&] { return documents().isPromised(url("My Notes/Two.txt")); }));
    EXPECT_TRUE(inTime([&] { return !platform::Platform::current().cloud().question(); }));
    EXPECT_TRUE(home.has("remote/Documents/My Notes/Two.txt"));
    EXPECT_EQ(alertText(), "");
}

} // namespace
} // namespace test
