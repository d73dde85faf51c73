#include "platform/documents/DocumentTargetSelectionController.h"
#include "tests/product/ProductFixture.h"

#include <filesystem>

using testing::ElementsAre;
using testing::HasSubstr;

namespace test {
namespace {

/// Edit mode and what is done with a selection.
struct Manage : ProductTest {
    void givenFolderOf(const std::vector<std::string>& files) {
        signIn();
        for (const std::string& file : files)
            givenFile(file, "of " + file);
        launch();
        open("Documents");
        for (const std::string& file : files)
            if (!file.starts_with('/') && !file.starts_with('.')) {
                EXPECT_TRUE(untilShows(file.substr(0, file.find('/'))));
            }
    }
    void select(const std::vector<std::string>& names) {
        std::vector<platform::Url> urls;
        for (const std::string& name : names)
            urls.push_back(row(name));
        list()->setSelectedItems(urls);
        settle();
    }
    void edit(const std::vector<std::string>& names) {
        nav().beginEditMode();
        select(names);
    }
    /// Of the three buttons of edit mode, those that can be pressed.
    std::string usable() const {
        std::string letters;
        for (const auto& [item, letter] : {std::pair(nav().barButtonNewFolder(), 'N'),
                                           {nav().barButtonMoveItem(), 'M'},
                                           {nav().barButtonDeleteItem(), 'D'}})
            if (item && item->isEnabled())
                letters += letter;
        return letters;
    }
    std::string title() const { return list()->navigationItem().title(); }
    void pressButton(const std::string& name) {
        ASSERT_NE(button(name), nullptr) << name;
        tap(*button(name));
        advance(1s);
    }
    void back() {
        nav().popViewController(false);
        advance(1s);
    }
    std::shared_ptr<platform::DocumentTargetSelectionController> chooser() {
        return std::dynamic_pointer_cast<platform::DocumentTargetSelectionController>(
            topPresented());
    }
    void chooseTarget(const std::string& folder) {
        const auto shown = chooser();
        ASSERT_NE(shown, nullptr);
        nav().documentTargetSelectionControllerDidSelectItemAtURL(*shown, url(folder));
        advance(1s);
    }
};

TEST_F(Manage, countsTheSelectionAndOffersWhatCanBeDoneWithIt) {
    givenFolderOf({"a.txt", "b.txt"});
    nav().beginEditMode();
    EXPECT_EQ(title(), "Select Items");
    EXPECT_EQ(usable(), "N");
    select({"a.txt", "b.txt"});
    EXPECT_EQ(title(), "2 Items Selected");
    EXPECT_EQ(usable(), "NMD");
    remove("b.txt");
    EXPECT_TRUE(until([&] { return title() == "1 Item Selected"; })) << "what is gone is not chosen";
    nav().endEditMode();
    EXPECT_EQ(title(), "Documents");
    EXPECT_EQ(usable(), "");
    EXPECT_EQ(list()->selectedItemCount(), 0U);
}

TEST_F(Manage, movesNoContainersAndDeletesThemOnlyAmongThemselves) {
    givenFolderOf({"/Boats/Oar.txt", "/Loose.txt"});
    back();
    ASSERT_TRUE(untilShows("Loose.txt"));
    edit({"Boats"});
    EXPECT_EQ(usable(), "D") << "and the root of the store takes no folder";
    select({"Boats", "Documents"});
    EXPECT_EQ(usable(), "D");
    select({"Boats", "Loose.txt"});
    EXPECT_EQ(usable(), "");
    bool finished = false;
    nav().showWarningAndDeleteURLs({row("Boats"), row("Loose.txt")}, nullptr, nullptr,
                                   [&] { finished = true; });
    EXPECT_TRUE(finished);
    EXPECT_EQ(alert(), nullptr);
}

TEST_F(Manage, makesFoldersAsDeepAsTheContainerLetsThem) {
    struct Rule {
        std::string levels;
        std::string atTop;
        std::string below;
    };
    const std::vector<Rule> rules{{"none", "", ""}, {"one", "N", ""}, {"any", "N", "N"},
                                  {"two", "", ""}};
    for (const Rule& rule : rules) {
        givenContainer(rule.levels, R"({"identifier":"com.example.)" + rule.levels +
                                        R"(","folderLevels":")" + rule.levels + R"("})");
        givenRemote("/" + rule.levels + "/Inner/Note.txt");
    }
    signIn();
    launch();
    const auto usableHere = [this](const std::string& folder) {
        open(folder);
        nav().beginEditMode();
        std::string letters = usable();
        nav().endEditMode();
        return letters;
    };
    EXPECT_EQ(usableHere("Documents"), "N") << "a container that says nothing";
    back();
    for (const Rule& rule : rules) {
        EXPECT_EQ(usableHere(rule.levels), rule.atTop) << rule.levels;
        EXPECT_EQ(usableHere("Inner"), rule.below) << rule.levels;
        back();
        back();
    }
}

TEST_F(Manage, asksForAFolderToMoveIntoWhereThereIsNone) {
    givenFolderOf({".hidden/x.txt", "A.txt", "b.txt"});
    edit({"A.txt", "b.txt"});
    pressButton("Move");
    EXPECT_FALSE(nav().editMode());
    EXPECT_EQ(alertText(), "Move 2 Items: Enter a name for this folder.");
    EXPECT_FALSE(button("Move")->isEnabled());
    type("  ");
    EXPECT_FALSE(button("Move")->isEnabled());
    type("A.txt");
    pressButton("Move");
    ASSERT_NE(alert(), nullptr) << "a name that is taken keeps the question open";
    EXPECT_NE(label("An item named “A.txt” already exists. Choose a different name."), nullptr);
    for (int i = 0; i < 7; ++i)
        press(Key::backspace);
    type("Spring");
    pressButton("Move");
    EXPECT_EQ(alert(), nullptr);
    EXPECT_TRUE(std::filesystem::exists(path("Spring/A.txt")));
    EXPECT_TRUE(std::filesystem::exists(path("Spring/b.txt")));
}

TEST_F(Manage, movesBesideTakenNamesAndTellsWhatCouldNotGo) {
    givenFolderOf({"Box/a.txt", "a.txt", "b.txt", "c.txt"});
    edit({"a.txt"});
    pressButton("Move");
    chooseTarget("Box");
    EXPECT_TRUE(std::filesystem::exists(path("Box/a 2.txt")));
    EXPECT_EQ(alert(), nullptr);

    const std::vector<platform::Url> gone{url("x.txt"), url("y.txt")};
    nav().moveItemsToDirectoryAndShowErrors({gone[0], url("b.txt")}, url("Box"));
    EXPECT_TRUE(std::filesystem::exists(path("Box/b.txt"))) << "one failure stops nobody";
    EXPECT_THAT(alertText(), HasSubstr("x.txt"));
    alert()->dismissViewController(false);
    nav().moveItemsToDirectoryAndShowErrors(gone, url("Box"));
    EXPECT_EQ(alertText(), "2 items could not be moved.: ");
}

TEST_F(Manage, deletesOnlyOnceItIsConfirmed) {
    givenFolderOf({"a.txt", "b.txt", "c.txt"});
    edit({"a.txt", "b.txt"});
    pressButton("Delete");
    EXPECT_EQ(alertText(), ": 2 items will be permanently deleted from Tavrin on all your devices. "
                           "This action cannot be undone.");
    pressButton("Cancel");
    EXPECT_TRUE(nav().editMode());
    EXPECT_EQ(list()->selectedItemCount(), 2U);
    pressButton("Delete");
    pressButton("Delete from Tavrin");
    EXPECT_FALSE(nav().editMode());
    EXPECT_TRUE(until([&] { return shown() == std::vector<std::string>{"c.txt"}; }));
    nav().showWarningAndDeleteURLs({url("a.txt"), url("b.txt")}, nullptr, nullptr, {});
    pressButton("Delete from Tavrin");
    EXPECT_EQ(alertText(), "2 items could not be deleted.: ");
}

TEST_F(Manage, deletesAContainerOnAllScreensAtOnceAndNeverTheDefaultOne) {
    givenFolderOf({"a.txt", "/Boats/Oar.txt"});
    back();
    ASSERT_TRUE(untilShows("Boats"));
    edit({"Boats"});
    pressButton("Delete");
    EXPECT_THAT(alertText(), HasSubstr("The Boats app library, and all its documents,"));
    pressButton("Delete from Tavrin");
    EXPECT_TRUE(until([&] { return shown() == std::vector<std::string>{"Documents"}; }));
    EXPECT_FALSE(std::filesystem::exists(remote + "/Boats"));
    edit({"Documents"});
    pressButton("Delete");
    pressButton("Delete from Tavrin");
    EXPECT_EQ(alertText(), "Error exception: ") << "a failure that brings no words of its own";
    EXPECT_THAT(shown(), ElementsAre("Documents"));
}

TEST_F(Manage, tellsTheItemsAndThenTheFreeSpace) {
    quota = 4'000'000'000;
    givenFolderOf({"a.txt", "b.txt"});
    const auto line = [this] { return nav().toolbarStatusText(list()->containedItemCount()); };
    ASSERT_TRUE(until([&] { return nav().okToShowQuota(); }));
    nav().quotaFetcherDidUpdateValue(*nav().quotaFetcher(), 1'610'612'736);
    EXPECT_EQ(line(), "2 items, 1.5 GB available");
    EXPECT_NE(label("2 items, 1.5 GB available"), nullptr);
    open("a.txt");
    nav().quotaFetcherDidUpdateValue(*nav().quotaFetcher(), 0);
    back();
    EXPECT_NE(label("2 items, 0 bytes available"), nullptr) << line();
}

} // namespace
} // namespace test
