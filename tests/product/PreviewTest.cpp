#include "platform/documents/DocumentSearchController.h"
#include "platform/documents/DocumentTargetSelectionController.h"
#include "platform/files/FileCoordinator.h"
#include "tests/product/PreviewFixture.h"

#include <future>

using tavrin::GlimpseItemController;
using tavrin::PreviewItemManager;
using tavrin::VXItem;
using testing::ElementsAre;
using testing::SizeIs;

namespace fs = std::filesystem;

namespace test {
namespace {

constexpr std::uint64_t autoLimit = 6'291'456;

struct Preview : PreviewTest {
    /// Documents with Here.txt on the device and Away.txt in the cloud.
    void givenTwo(platform::Size size = phone) {
        givenRemote("Away.txt", "far away");
        signIn();
        givenFile("Here.txt", "one");
        launch(size);
        open("Documents");
        ASSERT_TRUE(untilNetwork(tavrin::networkWiFi));
    }
    /// Brings the contents here as another program's wish would.
    void fetch(const std::string& name) {
        platform::WorkQueue other("other");
        other.sync([&] {
            EXPECT_FALSE(platform::FileCoordinator().coordinateReading(
                url(name), platform::ReadingOptions::none, [](const auto&) {}));
        });
    }
    void write(const std::string& name, const std::string& content) {
        std::ofstream(path(name)) << content;
    }
    /// Waits for the notices of what was done outside so far, then for the refresh they ask for.
    void untilRefreshed(const std::string& name) {
        EXPECT_TRUE(untilLogged("6 Refreshing " + told(name)));
        calmDown();
        advance(3s);
    }
    std::size_t refreshes(const std::string& name) const {
        return timesLogged("6 Refreshing " + told(name));
    }
    std::string shownFile() const {
        const auto& documents = GlimpseItemController::defaultController()->arrayOfDocuments();
        return documents ? std::string(documents->front().lastPathComponent()) : "";
    }
};

TEST_F(Preview, choosesTheScreenByModeAndPlace) {
    givenPromise("Away.txt", autoLimit);
    start();
    givenWholeLog();
    givenFile("Here.txt");
    const struct {
        const char* name;
        int mode;
        const char* line;
    } rows[] = {
        {"Here.txt", 0, "7 Preview: File exists, using GlimpseItemController"},
        {"Here.txt", 1, "7 Preview: File exists, using PreviewDetailsViewController"},
        {"Away.txt", 0, "7 Preview: File doesn't exist, using PreviewDownloadViewController"},
        {"Away.txt", -3, "7 Preview: File doesn't exist, using PreviewDetailsViewController"}};
    for (const auto& row : rows) {
        clearLog();
        preview(row.name, row.mode);
        EXPECT_TRUE(logged(row.line)) << row.line;
        EXPECT_EQ(showsFullPreview(), std::string(row.line).ends_with("GlimpseItemController"));
        EXPECT_EQ(details() != nullptr, row.mode != 0);
        EXPECT_EQ(details(), manager().detailsViewController());
        EXPECT_EQ(download(), manager().downloadViewController());
        EXPECT_TRUE(manager().filePresenterRegistered());
        back();
    }
    EXPECT_TRUE(isPromise("Away.txt"));
}

TEST_F(Preview, downloadsUnaskedOnlyOnWifiBelowTheLimitWhatItCanShow) {
    const std::pair<const char*, std::uint64_t> sizes[] = {
        {"Below", autoLimit - 1}, {"At", autoLimit}, {"Above", autoLimit + 1}};
    for (const auto& [name, size] : sizes)
        for (const std::string type : {".txt", ".odd"})
            givenPromise(name + type, size);
    start();
    const auto check = [&](bool wifi) {
        for (const auto& [name, size] : sizes)
            for (const std::string type : {".txt", ".odd"}) {
                const bool unasked = wifi && size < autoLimit && type == ".txt";
                SCOPED_TRACE(name + type);
                preview(name + type);
                EXPECT_EQ(manager().autoDownload(), unasked);
                EXPECT_TRUE(unasked ? untilFullPreview() : !download()->downloading());
                downloadsEnd();
                EXPECT_EQ(isPromise(name + type), !unasked);
                back();
            }
    };
    for (const auto& [script, state] : {std::pair{"cellular", tavrin::networkCellular},
                                        {"offline", tavrin::networkNotConnected},
                                        {"wifi", tavrin::networkWiFi}}) {
        SCOPED_TRACE(script);
        givenNetwork(script);
        ASSERT_TRUE(untilNetwork(state));
        if (state != tavrin::networkWiFi)
            check(false);
    }
    tavrin::NetworkWatcher::sharedNetworkWatcher()->stop();
    check(false);
    tavrin::NetworkWatcher::sharedNetworkWatcher()->start();
    ASSERT_TRUE(untilNetwork(tavrin::networkWiFi));
    check(true);
}

TEST_F(Preview, swapsTheDownloadForTheDocumentInPlace) {
    givenTwo();
    nav().showPreview(std::make_shared<VXItem>(url("Away.txt")), 0);
    const auto before = nav().viewControllers();
    ASSERT_NE(download(), nullptr);
    ASSERT_TRUE(untilFullPreview());
    ASSERT_THAT(nav().viewControllers(), SizeIs(before.size()));
    EXPECT_EQ(nav().viewControllers()[1], before[1]);
    EXPECT_EQ(manager().downloadViewController(), nullptr);
    EXPECT_EQ(manager().downloadFC(), nullptr);
    EXPECT_EQ(shownFile(), "Away.txt");
    advance(1s);
    EXPECT_THAT(titles(), ElementsAre("Tavrin", "Documents", "Away.txt"));
}

TEST_F(Preview, doesNotComeBackOnceLeft) {
    givenTwo();
    givenNetwork("cellular");
    ASSERT_TRUE(untilNetwork(tavrin::networkCellular));
    preview("Away.txt");
    manager().startDownload();
    // The contents are there, and nobody has been told, when the person goes back.
    manager().downloadQueue()->sync([] {});
    ASSERT_FALSE(isPromise("Away.txt"));
    nav().popViewController(true);
    advance(20ms); // the page still slides
    EXPECT_NE(nav().itemManager(), nullptr);
    advance(2s);
    EXPECT_THAT(titles(), ElementsAre("Tavrin", "Documents"));
    EXPECT_TRUE(logged("6 Showing preview of URL " + told("Away.txt")));
}

TEST_F(Preview, keepsWatchingTheSameFileAndLetsGoOfAnother) {
    givenTwo();
    preview("Here.txt");
    manager().setItem(std::make_shared<VXItem>(url("Here.txt")));
    EXPECT_TRUE(manager().filePresenterRegistered());
    write("Here.txt", "two");
    untilRefreshed("Here.txt");
    EXPECT_EQ(refreshes("Here.txt"), 1U);
    givenFile("Other.txt");
    manager().setItem(std::make_shared<VXItem>(url("Other.txt")));
    advance(1s);
    EXPECT_THAT(nav().viewControllers(), SizeIs(3));
    clearLog();
    write("Here.txt", "three");
    write("Other.txt", "new");
    untilRefreshed("Other.txt");
    EXPECT_EQ(timesLogged("6 " + told("Here.txt") + " changed"), 0U);
}

TEST_F(Preview, showsNothingOfAnItemWithoutAPlace) {
    givenTwo();
    preview("Here.txt");
    const auto before = nav().viewControllers();
    manager().setItem(std::make_shared<VXItem>(std::nullopt));
    EXPECT_TRUE(logged("4 no preview URL, nothing to show"));
    EXPECT_EQ(nav().viewControllers(), before);
    EXPECT_FALSE(manager().filePresenterRegistered());
    EXPECT_EQ(manager().prepareToPreviewItem(nullptr), nullptr);
}

TEST_F(Preview, waitsForASearchToGiveWay) {
    givenTwo();
    const auto search = platform::DocumentSearchController::create(list());
    nav().presentViewController(search, false);
    advance(1s);
    nav().showPreview(std::make_shared<VXItem>(url("Here.txt")), 0);
    EXPECT_FALSE(showsFullPreview());
    advance(2s);
    EXPECT_EQ(topPresented(), nullptr);
    EXPECT_TRUE(showsFullPreview());
}

TEST_F(Preview, mergesABurstOfChangesIntoOneRefresh) {
    givenTwo();
    preview("Here.txt");
    clearLog();
    for (int i = 0; i < 10; ++i)
        manager().presentedItemDidChange();
    advance(999ms);
    EXPECT_TRUE(manager().refreshPending());
    EXPECT_EQ(refreshes("Here.txt"), 0U);
    advance(1ms);
    EXPECT_FALSE(manager().refreshPending());
    EXPECT_EQ(refreshes("Here.txt"), 1U);
    EXPECT_EQ(timesLogged("6 " + told("Here.txt") + " changed"), 10U);
    advance(5s);
    EXPECT_EQ(refreshes("Here.txt"), 1U);
    clearLog();
    for (int i = 0; i < 10'000; ++i) {
        manager().presentedItemDidChange();
        if (i % 1000 == 999)
            advance(90ms);
    }
    advance(5s);
    EXPECT_EQ(refreshes("Here.txt"), 1U);
}

TEST_F(Preview, showsAnEditFromOutsideOnce) {
    givenTwo();
    preview("Here.txt", tavrin::detailsMode);
    const auto before = manager().modifiedDate();
    const auto screen = details();
    write("Here.txt", std::string(5000, 'x'));
    untilRefreshed("Here.txt");
    EXPECT_EQ(refreshes("Here.txt"), 1U);
    EXPECT_NE(label("5 KB"), nullptr);
    EXPECT_LT(*before, *manager().modifiedDate());
    EXPECT_EQ(details(), screen);
}

TEST_F(Preview, followsARenameAndAMoveFromOutside) {
    givenTwo();
    givenFolder("Notes");
    preview("Here.txt");
    rename("Here.txt", "There.txt");
    untilRefreshed("There.txt");
    EXPECT_EQ(shownFile(), "There.txt");
    EXPECT_EQ(manager().presentedItemURL(), url("There.txt"));
    EXPECT_EQ(refreshes("There.txt"), 1U);
    rename("There.txt", "Notes/There.txt");
    untilRefreshed("Notes/There.txt");
    EXPECT_EQ(manager().presentedItemURL(), url("Notes/There.txt"));
    EXPECT_TRUE(showsFullPreview());
    write("Notes/There.txt", "still followed");
    EXPECT_TRUE(whileTimePasses([&] { return refreshes("Notes/There.txt") == 2; }));
    EXPECT_THAT(nav().viewControllers(), SizeIs(3));
}

TEST_F(Preview, goesBackOnceWhenTheFileIsDeletedOutside) {
    for (const int mode : {tavrin::fullPreviewMode, tavrin::detailsMode}) {
        if (mode == tavrin::fullPreviewMode)
            givenTwo();
        givenFile("Here.txt");
        preview("Here.txt", mode);
        const auto held = nav().itemManager();
        clearLog();
        remove("Here.txt");
        EXPECT_TRUE(whileTimePasses([&] { return nav().viewControllers().size() == 2; }));
        calmDown();
        advance(3s);
        EXPECT_THAT(titles(), ElementsAre("Tavrin", "Documents"));
        EXPECT_EQ(timesLogged("6 " + told("Here.txt") + " accommodate deletion"), 1U);
        EXPECT_FALSE(held->filePresenterRegistered());
        EXPECT_EQ(nav().itemManager(), nullptr);
    }
}

TEST_F(Preview, showsWhatArrivesByAnotherRoute) {
    givenTwo();
    givenNetwork("cellular");
    ASSERT_TRUE(untilNetwork(tavrin::networkCellular));
    preview("Away.txt", tavrin::detailsMode);
    const auto screen = details();
    fetch("Away.txt");
    untilRefreshed("Away.txt");
    EXPECT_EQ(details(), screen);
    EXPECT_TRUE(manager().item()->isDownloaded());
    back();
    ASSERT_FALSE(documents().evictItem(url("Away.txt")));
    preview("Away.txt");
    ASSERT_NE(download(), nullptr);
    fetch("Away.txt");
    EXPECT_TRUE(whileTimePasses([&] { return showsFullPreview(); }));
    EXPECT_THAT(nav().viewControllers(), SizeIs(3));
}

TEST_F(Preview, keepsWhatArrivedWhileItsOwnDownloadStillWaits) {
    givenTwo();
    givenNetwork("cellular");
    ASSERT_TRUE(untilNetwork(tavrin::networkCellular));
    preview("Away.txt");
    fetch("Away.txt");
    ASSERT_TRUE(whileTimePasses([this] { return manager().refreshPending(); }, 0ms));
    std::promise<void> holds;
    std::promise<void> release;
    platform::WorkQueue writer("writer");
    writer.async([&] {
        const platform::Failure failure = platform::FileCoordinator().coordinateWriting(
            url("Away.txt"), platform::WritingOptions::none, [&](const auto&) {
                holds.set_value();
                release.get_future().wait();
            });
        EXPECT_FALSE(failure);
    });
    holds.get_future().wait();
    manager().startDownload();
    advance(1s); // the refresh finds the contents, and shows them
    EXPECT_TRUE(showsFullPreview());
    release.set_value();
    downloadsEnd();
    EXPECT_TRUE(fs::exists(path("Away.txt")));
}

TEST_F(Preview, hearsNothingWhileTheProgramIsInactive) {
    givenTwo();
    preview("Here.txt");
    givenWholeLog();
    application->setActive(false);
    EXPECT_FALSE(manager().filePresenterRegistered());
    EXPECT_TRUE(logged("7 Resigning active for " + told("Here.txt")));
    write("Here.txt", "meanwhile");
    calmDown();
    advance(2s);
    EXPECT_EQ(refreshes("Here.txt"), 0U);
    application->setActive(true);
    ASSERT_TRUE(manager().filePresenterRegistered());
    write("Here.txt", "now");
    untilRefreshed("Here.txt");
    EXPECT_EQ(refreshes("Here.txt"), 1U);
}

TEST_F(Preview, movesTheRestWhenOneItemCannotBe) {
    givenTwo();
    givenFolder("Notes");
    preview("Here.txt");
    const auto chooser =
        platform::DocumentTargetSelectionController::create({url("Nothing.txt"), url("Here.txt")});
    nav().presentViewController(chooser, false);
    manager().documentTargetSelectionControllerDidSelectItemAtURL(*chooser, url("Notes"));
    advance(1s);
    ASSERT_NE(alert(), nullptr);
    EXPECT_NE(alertText().find("Nothing.txt"), std::string::npos) << alertText();
    alert()->dismissViewController(false);
    advance(1s);
    EXPECT_EQ(topPresented(), nullptr);
    EXPECT_TRUE(fs::exists(path("Notes/Here.txt")));
    untilRefreshed("Notes/Here.txt");
    EXPECT_TRUE(showsFullPreview());
    EXPECT_EQ(manager().presentedItemURL(), url("Notes/Here.txt"));
}

TEST_F(Preview, asksForAFolderOverTheDocument) {
    givenTwo();
    preview("Here.txt");
    givenWholeLog();
    clearLog();
    GlimpseItemController::defaultController()->showMoveTarget();
    advance(1s);
    EXPECT_EQ(timesLogged("6 Pressed Move"), 2U);
    EXPECT_EQ(timesLogged("7 Presented moveTarget"), 1U);
    const auto chooser =
        std::dynamic_pointer_cast<platform::DocumentTargetSelectionController>(topPresented());
    ASSERT_NE(chooser, nullptr);
    EXPECT_THAT(chooser->itemsToMove(), ElementsAre(url("Here.txt")));
}

TEST_F(Preview, deletesFromThePreviewOnlyWhenConfirmed) {
    givenTwo();
    for (const int mode : {tavrin::fullPreviewMode, tavrin::detailsMode}) {
        givenFile("Here.txt");
        for (const std::string answer : {"Cancel", "Delete from Tavrin"}) {
            if (showsFullPreview() || details())
                back();
            preview("Here.txt", mode);
            const auto deleteItem = details() ? details()->barButtonDeleteItem()
                                              : top<GlimpseItemController>()->barButtonDeleteItem();
            tap(*deleteItem->shownView());
            advance(1s);
            ASSERT_NE(button(answer), nullptr) << testing::PrintToString(buttonTitles());
            tap(*button(answer));
            advance(1s);
            EXPECT_EQ(fs::exists(path("Here.txt")), answer == "Cancel");
            EXPECT_EQ(nav().viewControllers().size(), answer == "Cancel" ? 3U : 2U);
        }
        calmDown();
        advance(2s);
        EXPECT_THAT(titles(), ElementsAre("Tavrin", "Documents"));
        EXPECT_EQ(topPresented(), nullptr);
    }
}

TEST_F(Preview, showsNoDocumentForAManagerWithoutAnItem) {
    givenTwo();
    const auto screen = GlimpseItemController::createWithItemManager(PreviewItemManager::create());
    EXPECT_EQ(screen->numberOfPreviewItemsInPreviewController(*screen), 0U);
    EXPECT_EQ(screen->previewControllerPreviewItemAtIndex(*screen, 0), std::nullopt);
    EXPECT_FALSE(screen->isVisible());
}

} // namespace
} // namespace test
