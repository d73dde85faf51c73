#include "platform/cloud/CloudAccountService.h"
#include "platform/documents/DocumentSearchController.h"
#include "platform/system/PreferencesStore.h"
#include "platform/system/SourceApplications.h"
#include "preview/PreviewItemManager.h"
#include "tests/product/ProductFixture.h"

#include <filesystem>
#include <unistd.h>

using platform::DocumentAction;
using testing::Contains;
using testing::ElementsAre;
using testing::EndsWith;
using testing::Not;

namespace test {
namespace {

struct Browse : ProductTest {
    /// Documents with a folder Notes, in it Milk.txt; nothing of it on the device.
    void givenNotes() {
        givenRemote("Notes/Milk.txt", "two litres");
        signIn();
        launch();
        open("Documents");
    }
    bool untilTitled(const std::string& title) {
        return until([&] { return titles().back() == title; });
    }
    void perform(int action, const platform::Url& url) {
        nav().documentListControllerPerformAction(*list(), action, url, list()->view(),
                                                  [this] { ++completions; });
        advance(1s);
    }
    void perform(DocumentAction action, const platform::Url& url) {
        perform(static_cast<int>(action), url);
    }
    std::vector<std::string> sheetEntries() {
        std::vector<std::string> entries;
        for (const auto& action : alert()->actions())
            entries.push_back(action->title() + (action->isEnabled() ? "" : " (off)"));
        return entries;
    }
    bool hasStoredToken() const {
        return !platform->standardPreferences()
                    .value("com.pelmora.Tavrin.UbiquityIdentityToken")
                    .isNone();
    }
    int completions = 0;
};

TEST_F(Browse, goesFromTheStoreToADocument) {
    givenNotes();
    open("Notes");
    open("Milk.txt");
    EXPECT_TRUE(untilTitled("Milk.txt"));
    EXPECT_THAT(titles(), ElementsAre("Tavrin", "Documents", "Notes", "Milk.txt"));
    EXPECT_TRUE(std::filesystem::exists(path("Notes/Milk.txt")));
    nav().popViewController(false);
    advance(1s);
    EXPECT_EQ(nav().itemManager(), nullptr);
}

TEST_F(Browse, rebuildsOnlyWhenAnotherAccountIsSeen) {
    signIn();
    launch();
    EXPECT_TRUE(logged("6 Pelmora Token Changed, enabled=YES, reinitializing view"));
    const auto before = list();
    application->setActive(false);
    application->setActive(true);
    EXPECT_EQ(list(), before);
    open("Documents");
    signInAs("bert", "other");
    EXPECT_TRUE(until([&] { return window().statusStrip().account == "bert"; }));
    EXPECT_THAT(titles(), ElementsAre("Tavrin"));
    EXPECT_EQ(window().statusStrip().network, "Wi-Fi");
}

TEST_F(Browse, showsThePlaceholderOnceSignedOutAndTheStoreOnceBack) {
    signIn();
    launch();
    EXPECT_TRUE(hasStoredToken());
    signOut();
    EXPECT_FALSE(hasStoredToken());
    EXPECT_EQ(list(), nullptr);
    EXPECT_TRUE(nav().isToolbarHidden());
    EXPECT_EQ(nav().quotaFetcher(), nullptr);
    EXPECT_TRUE(logged("6 Pelmora Token Changed, enabled=NO, reinitializing view"));
    signInAs("bert", "other");
    EXPECT_NE(list(), nullptr);
    EXPECT_FALSE(nav().isToolbarHidden());
}

TEST_F(Browse, comesBackWithThePreviewItHadAndWithoutAVanishedOne) {
    signIn();
    givenFile("Milk.txt", "two litres");
    launch();
    open("Documents");
    open("Milk.txt");
    ASSERT_TRUE(untilTitled("Milk.txt"));
    advance(3s); // it may be killed from here on
    relaunch();
    ASSERT_TRUE(untilTitled("Milk.txt"));
    advance(3s);
    remove("Milk.txt");
    relaunch();
    calmDown();
    EXPECT_THAT(titles(), ElementsAre("Tavrin"));
}

TEST_F(Browse, refusesToWanderInEditMode) {
    givenNotes();
    ASSERT_TRUE(untilShows("Notes"));
    nav().beginEditMode();
    open("Notes");
    EXPECT_THAT(titles(), ElementsAre("Tavrin", "Documents"));
    EXPECT_TRUE(logged("4 DLC Navigation not allowed while in edit mode"));
    givenFile("Here.txt");
    open("Here.txt");
    calmDown();
    EXPECT_THAT(titles(), ElementsAre("Tavrin", "Documents"));
}

TEST_F(Browse, showsTheDetailsAndCompletesTheRowActionAtOnce) {
    givenNotes();
    ASSERT_TRUE(untilShows("Notes"));
    perform(DocumentAction::information, row("Notes"));
    EXPECT_EQ(completions, 1);
    ASSERT_NE(nav().itemManager(), nullptr);
    EXPECT_EQ(nav().itemManager()->mode(), 1);
    EXPECT_EQ(nav().viewControllers().size(), 3U);
    nav().popViewController(false);
    advance(1s);
    perform(17, url("Notes"));
    EXPECT_EQ(completions, 2);
    EXPECT_TRUE(logged("4 performAction:17 -- unexpected value"));
}

TEST_F(Browse, offersOfAContainerNothingButToGo) {
    signIn();
    launch();
    ASSERT_TRUE(untilShows("Documents"));
    perform(DocumentAction::more, row("Documents"));
    EXPECT_THAT(sheetEntries(), ElementsAre("Rename Item… (off)", "Cancel"));
    tap(*button("Cancel"));
    advance(1s);
    EXPECT_EQ(completions, 1);
}

TEST_F(Browse, offersAMoveOnlyWhereThereAreFolders) {
    givenContainer("Letters", R"({"identifier":"com.example.letters","names":{"":"Letters"}})");
    givenRemote("/Letters/Dear.txt");
    givenRemote("Notes/Milk.txt");
    signIn();
    launch();
    open("Letters");
    ASSERT_TRUE(untilShows("Dear.txt"));
    perform(DocumentAction::more, row("Dear.txt"));
    EXPECT_THAT(sheetEntries(), ElementsAre("Rename Item…", "Share Item…", "Cancel"));
    tap(*button("Cancel"));
    advance(1s);
    nav().popViewController(false);
    advance(1s);
    open("Documents");
    open("Notes");
    ASSERT_TRUE(untilShows("Milk.txt"));
    perform(DocumentAction::more, row("Milk.txt"));
    EXPECT_THAT(sheetEntries(), Contains("Move to Folder…"));
}

TEST_F(Browse, renamesByTheRowBesideATakenName) {
    signIn();
    givenFile("Milk.txt");
    givenFile("Bread.txt");
    launch();
    open("Documents");
    ASSERT_TRUE(untilShows("Milk.txt"));
    perform(DocumentAction::rename, row("Milk.txt"));
    EXPECT_EQ(completions, 1);
    ASSERT_EQ(alertText(), "Rename Item: Enter a new name for this item.");
    const auto field = alert()->textFields().front();
    ASSERT_EQ(field->text(), "Milk.txt");
    for (int i = 0; i < 8; ++i)
        press(Key::backspace);
    type("Rye/");
    EXPECT_NE(label("Character not allowed in filename"), nullptr);
    EXPECT_FALSE(button("Done")->isEnabled());
    for (int i = 0; i < 4; ++i)
        press(Key::backspace);
    type("Bread");
    tap(*button("Done"));
    advance(1s);
    EXPECT_EQ(alert(), nullptr);
    EXPECT_TRUE(untilShows("Bread 2.txt"));
}

TEST_F(Browse, opensTheScreensDownToADeepAddressForKnownCallersOnly) {
    givenRemote("Notes/Milk.txt", "two litres");
    signIn();
    launch();
    const std::string address = "tavrinapp://x" + url("Notes/Milk.txt").path() + "?mode=details";
    EXPECT_FALSE(application->openUrl(address, {{"SourceApplication", "org.example.other"}}));
    EXPECT_TRUE(logged("4 Ignoring openURL launch from unknown source: org.example.other"));
    const platform::OpenUrlOptions known = {
        {std::string(platform::sourceApplicationKey),
         std::string(platform::testRunnerApplicationIdentifier)}};
    EXPECT_FALSE(application->openUrl("other:" + url("Notes").path(), known));
    EXPECT_FALSE(application->openUrl("tavrinapp:///etc/passwd", known));
    EXPECT_FALSE(application->openUrl("tavrinapp://x" + url("Nothing/Here.txt").path(), known));
    EXPECT_THAT(titles(), ElementsAre("Tavrin"));
    EXPECT_TRUE(application->openUrl(address, known));
    advance(1s);
    EXPECT_EQ(nav().viewControllers().size(), 4U);
    EXPECT_EQ(titles()[2], "Notes");
    EXPECT_EQ(nav().itemManager()->mode(), 1);
    EXPECT_EQ(list(), nullptr);
}

TEST_F(Browse, comesBackToItsPreviewWhenItWasKilledButNotToAListNorInACircle) {
    signIn();
    givenFile("Plan.txt");
    launch();
    nav().showPreview(std::make_shared<tavrin::VXItem>(url("Plan.txt")), 1);
    advance(3s);
    relaunch(); // without a word to the one before
    ASSERT_NE(nav().itemManager(), nullptr);
    EXPECT_EQ(nav().itemManager()->item()->url(), url("Plan.txt"));
    EXPECT_EQ(nav().itemManager()->mode(), 1);
    relaunch(); // the screen had not stood for long
    EXPECT_EQ(nav().itemManager(), nullptr);
    advance(3s);
    relaunch();
    EXPECT_EQ(nav().itemManager(), nullptr);
}

TEST_F(Browse, takesTheWholePathOfAFolderTappedInTheSearch) {
    givenNotes();
    ASSERT_TRUE(untilShows("Notes"));
    nav().popViewController(false);
    advance(1s);
    const auto search = platform::DocumentSearchController::create(list());
    nav().presentViewController(search, false);
    nav().documentListControllerDidSelectContainerWithViewController(
        *list(), platform::DocumentListController::createForURL(url("Notes")));
    advance(1s);
    EXPECT_THAT(titles(), ElementsAre("Tavrin", "Documents", "Notes"));
    EXPECT_EQ(topPresented(), nullptr);
}

TEST_F(Browse, saysWhatAnUnreadableFolderIs) {
    if (::geteuid() == 0)
        GTEST_SKIP() << "the superuser reads everything";
    givenNotes();
    givenFolder("Locked");
    std::filesystem::permissions(path("Locked"), std::filesystem::perms::none);
    open("Locked");
    EXPECT_NE(label("This folder cannot be read"), nullptr);
    std::filesystem::permissions(path("Locked"), std::filesystem::perms::owner_all);
}

} // namespace
} // namespace test
