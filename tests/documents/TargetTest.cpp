// The chooser of a folder into which items go: where it starts, what can be opened, when it says
// no, how folders are made in it.

#include "platform/cloud/CloudAccountService.h"
#include "platform/documents/DocumentTargetSelectionController.h"
#include "platform/documents/list/ListView.h"
#include "platform/documents/list/ListWidget.h"
#include "platform/documents/model/FolderModel.h"
#include "platform/documents/targets/TargetScreen.h"
#include "platform/ui/AlertController.h"
#include "tests/documents/ScreenHouse.h"
#include "tests/ui/Person.h"

#include <QAccessible>
#include <QtTest/QTest>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using namespace platform;
using namespace std::chrono_literals;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

namespace {

struct ChooserDelegate : DocumentTargetSelectionControllerDelegate {
    void
    documentTargetSelectionControllerDidSelectItemAtURL(DocumentTargetSelectionController& chooser,
                                                        const Url& folder) override {
        chosen.push_back(folder);
        chooser.dismissViewController(true);
    }
    std::vector<Url> chosen;
};

struct Target : ::testing::Test, test::Person {
    test::ScreenHouse house;
    std::shared_ptr<ChooserDelegate> delegate = std::make_shared<ChooserDelegate>();
    std::shared_ptr<DocumentTargetSelectionController> chooser;

    Window& window() override { return *house.window; }
    void settle() override { house.settle(); }

    void open(Size size = {360, 640}) {
        house.signIn();
        house.openWindow(size);
    }
    /// A container whose rules are that JSON.
    void givenContainer(const std::string& name, const std::string& rules) {
        house.givenRemote("/" + name + "/.container.json",
                          R"({"identifier":"com.example.)" + name + R"(",)" + rules + "}");
        house.givenRemote("/" + name + "/Deep/inside.txt");
    }
    void move(const std::vector<std::string>& items) {
        std::vector<Url> urls;
        for (const std::string& item : items)
            urls.push_back(house.url(item).markedAsDirectory(item.ends_with('/')));
        chooser = DocumentTargetSelectionController::create(urls);
        chooser->setDelegate(delegate);
        house.navigation->presentViewController(chooser, true);
        arrive();
    }
    void arrive() {
        house.advance(1s);
        ASSERT_TRUE(house.until([this] { return top().model().state() != ModelState::loading; }));
        house.advance(1s);
    }
    NavigationController& stack() const {
        return static_cast<NavigationController&>(*chooser->childViewControllers().front());
    }
    TargetScreen& top() const { return static_cast<TargetScreen&>(*stack().topViewController()); }
    ListState& rows() const { return top().list().widget().state(); }
    std::vector<std::string> titles() const {
        std::vector<std::string> all;
        for (const auto& screen : stack().viewControllers())
            all.push_back(screen->title());
        return all;
    }
    std::size_t rowNamed(std::string_view name) const {
        for (std::size_t i = 0; i < rows().model.count(); ++i)
            if (rows().model.entryAt(i).title() == name)
                return i;
        ADD_FAILURE() << "no row " << name;
        return 0;
    }
    bool allows(std::string_view name) const { return rows().allows(rowNamed(name)); }
    void tapRow(std::string_view name) {
        const Point at = rows().rowRect(rowNamed(name)).center();
        QTest::mouseClick(&top().list().widget(), Qt::LeftButton, {},
                          {static_cast<int>(at.x), static_cast<int>(at.y)});
        arrive();
    }
    void keys(std::initializer_list<Qt::Key> all) {
        for (const Qt::Key key : all)
            QTest::keyClick(&top().list().widget(), key);
        arrive();
    }
    /// The folder's list shows the row; for changes that come by the disk's notices.
    bool untilShown(const std::string& name) {
        return house.until([&] { return top().model().contains(name); });
    }
    bool canMoveHere() { return button("Move Here")->isEnabled(); }
    void tapButton(std::string_view title) {
        ASSERT_TRUE(button(title)) << title;
        tap(*button(title));
        house.advance(1s);
    }
};

TEST_F(Target, startsWhereTheItemsAreWithTheWayBackToTheContainers) {
    open();
    house.givenFile("Work/Plans/a.txt");
    house.givenFolder("Work/Plans/Old");
    move({"Work/Plans/a.txt"});
    EXPECT_THAT(titles(), ElementsAre("Tavrin", "Documents", "Work", "Plans"));
    EXPECT_THAT(top().reason(), HasSubstr("“a.txt” is here already"));
    EXPECT_FALSE(canMoveHere());
    tapRow("Old");
    EXPECT_EQ(top().reason(), "");
    tapButton("Move Here");
    EXPECT_THAT(delegate->chosen, ElementsAre(house.url("Work/Plans/Old")));
    EXPECT_EQ(house.navigation->presentedViewController(), nullptr);
}

TEST_F(Target, itemsOfSeveralFoldersStartWhereTheirWaysPart) {
    open();
    house.givenFile("Work/A/a.txt");
    house.givenFile("Work/B/b.txt");
    move({"Work/A/a.txt", "Work/B/b.txt"});
    EXPECT_THAT(titles(), ElementsAre("Tavrin", "Documents", "Work"));
    EXPECT_TRUE(canMoveHere());
}

TEST_F(Target, documentsAndTheMovedFoldersThemselvesCannotBeOpened) {
    open();
    house.givenFile("Note.txt");
    house.givenFile("Trip/a.txt");
    house.givenFolder("Other");
    move({"Trip/"});
    EXPECT_FALSE(allows("Note.txt"));
    EXPECT_FALSE(allows("Trip"));
    EXPECT_TRUE(allows("Other"));
    tapRow("Trip");
    tapRow("Note.txt");
    EXPECT_THAT(titles(), ElementsAre("Tavrin", "Documents"));
    QAccessibleInterface* const list =
        QAccessible::queryAccessibleInterface(&top().list().widget());
    EXPECT_TRUE(list->child(static_cast<int>(rowNamed("Trip")))->state().disabled);
    EXPECT_FALSE(list->child(static_cast<int>(rowNamed("Other")))->state().disabled);
}

TEST_F(Target, theKeyboardGoesOverWhatCannotBeOpened) {
    open();
    house.givenFolder("A");
    house.givenFolder("B");
    house.givenFolder("C");
    house.givenFile("file.txt");
    move({"B/"});
    keys({Qt::Key_Home, Qt::Key_Down});
    EXPECT_EQ(rows().indexOf(rows().current), rowNamed("C"));
    keys({Qt::Key_Down, Qt::Key_End});
    EXPECT_EQ(rows().indexOf(rows().current), rowNamed("C"));
    keys({Qt::Key_B, Qt::Key_Up});
    EXPECT_EQ(rows().indexOf(rows().current), rowNamed("A"));
    keys({Qt::Key_Return});
    EXPECT_THAT(titles(), ElementsAre("Tavrin", "Documents", "A"));
    // An empty folder has nothing that Enter could open: it takes the items.
    keys({Qt::Key_Return});
    EXPECT_THAT(delegate->chosen, ElementsAre(house.url("A")));
}

TEST_F(Target, escapeAndCancelLeaveEverythingAsItWas) {
    open();
    house.givenFile("a.txt");
    for (const bool byKey : {true, false}) {
        move({"a.txt"});
        byKey ? keys({Qt::Key_Escape}) : tapButton("Cancel");
        EXPECT_EQ(house.navigation->presentedViewController(), nullptr);
    }
    EXPECT_THAT(delegate->chosen, IsEmpty());
}

TEST_F(Target, theRootOfTheStoreTakesNothing) {
    givenContainer("Sketches", R"("names":{"en":"My Sketches"})");
    open();
    house.givenFile("a.txt");
    move({"a.txt"});
    press(test::Key::altLeft);
    arrive();
    EXPECT_THAT(titles(), ElementsAre("Tavrin"));
    EXPECT_NE(top().reason(), "");
    EXPECT_FALSE(canMoveHere());
    EXPECT_FALSE(button("New Folder")->isEnabled());
    tapRow("My Sketches");
    EXPECT_TRUE(canMoveHere());
}

TEST_F(Target, aNameThatIsTakenIsSaidAndUnsaidAsTheFolderChanges) {
    open();
    house.givenFile("a.txt");
    house.givenFile("Work/b.txt");
    move({"a.txt"});
    tapRow("Work");
    EXPECT_TRUE(canMoveHere());
    house.givenFile("Work/a.txt");
    ASSERT_TRUE(untilShown("a.txt"));
    EXPECT_THAT(top().reason(), HasSubstr("here already"));
    EXPECT_FALSE(canMoveHere());
    house.remove("Work/a.txt");
    ASSERT_TRUE(house.until([&] { return !top().model().contains("a.txt"); }));
    EXPECT_TRUE(canMoveHere());
}

TEST_F(Target, theFolderLevelsOfAContainerLimitFoldersAlone) {
    givenContainer("Flat", R"("folderLevels":"none")");
    givenContainer("Shallow", R"("folderLevels":"one")");
    open();
    house.givenFile("a.txt");
    house.givenFolder("Plain");
    house.givenFolder("Nested/Inner");
    const auto reasonIn = [&](const std::string& item, std::vector<std::string> way) {
        move({item});
        press(test::Key::altLeft);
        arrive();
        for (const std::string& folder : way)
            tapRow(folder);
        const std::string reason = top().reason();
        tapButton("Cancel");
        return reason;
    };
    EXPECT_EQ(reasonIn("a.txt", {"Flat"}), "");
    EXPECT_THAT(reasonIn("Plain/", {"Flat"}), HasSubstr("does not take folders"));
    EXPECT_EQ(reasonIn("Plain/", {"Shallow"}), "");
    EXPECT_THAT(reasonIn("Plain/", {"Shallow", "Deep"}), HasSubstr("folders within folders"));
    EXPECT_THAT(reasonIn("Nested/", {"Shallow"}), HasSubstr("folders within folders"));
    EXPECT_EQ(reasonIn("a.txt", {"Shallow", "Deep"}), "");
}

TEST_F(Target, aContainerOfPicturesTakesPicturesAlone) {
    givenContainer("Pictures",
                   R"("documentTypes":[{"name":"Picture","contentTypes":["public.image"]}])");
    open();
    for (const std::string name : {"photo.jpg", "text.txt", "no extension"})
        house.givenFile(name);
    const auto reasonFor = [&](const std::vector<std::string>& items) {
        move(items);
        press(test::Key::altLeft);
        arrive();
        tapRow("Pictures");
        const std::string reason = top().reason();
        tapButton("Cancel");
        return reason;
    };
    EXPECT_EQ(reasonFor({"photo.jpg", "no extension"}), "");
    EXPECT_THAT(reasonFor({"text.txt"}), HasSubstr("of this kind"));
    EXPECT_THAT(reasonFor({"photo.jpg", "text.txt"}), HasSubstr("all of these"));
}

TEST_F(Target, aNewFolderIsMadeAndOpened) {
    open();
    house.givenFile("a.txt");
    house.givenFile("Taken");
    move({"a.txt"});
    tapButton("New Folder");
    type("a:b");
    EXPECT_TRUE(label("Character not allowed in filename"));
    EXPECT_FALSE(button("Create")->isEnabled());
    for (int i = 0; i < 3; ++i)
        press(test::Key::backspace);
    type("Taken");
    tapButton("Create");
    ASSERT_TRUE(button("Create")) << "the question stays open and says why";
    type(" no more ");
    tapButton("Create");
    arrive();
    EXPECT_THAT(titles(), ElementsAre("Tavrin", "Documents", "Taken No More"));
    EXPECT_TRUE(canMoveHere());
    tapButton("Move Here");
    EXPECT_THAT(delegate->chosen, ElementsAre(house.url("Taken No More")));
}

TEST_F(Target, newFoldersAreOfferedWhereTheContainerAllowsThem) {
    givenContainer("Shallow", R"("folderLevels":"one")");
    open();
    house.givenFile("a.txt");
    move({"a.txt"});
    press(test::Key::altLeft);
    arrive();
    tapRow("Shallow");
    EXPECT_TRUE(button("New Folder")->isEnabled());
    tapRow("Deep");
    EXPECT_FALSE(button("New Folder")->isEnabled());
    EXPECT_TRUE(canMoveHere());
}

TEST_F(Target, aFolderThatVanishesTakesNothingAnyMore) {
    open();
    house.givenFile("a.txt");
    house.givenFolder("Work");
    move({"a.txt"});
    tapRow("Work");
    house.remove("Work");
    ASSERT_TRUE(house.until([&] { return top().model().state() == ModelState::failed; }));
    EXPECT_FALSE(canMoveHere());
    EXPECT_FALSE(button("New Folder")->isEnabled());
    ASSERT_TRUE(top().list().page());
    EXPECT_EQ(top().list().page()->title(), "This folder is no longer here");
}

TEST_F(Target, goesWithItsQuestionWhenTheAccountDoes) {
    open();
    house.givenFile("a.txt");
    move({"a.txt"});
    tapButton("New Folder");
    ASSERT_TRUE(button("Create"));
    house.platform->notifications().post(cloudIdentityDidChangeNotification);
    house.advance(1s);
    EXPECT_EQ(house.navigation->presentedViewController(), nullptr);
    EXPECT_FALSE(button("Create"));
}

} // namespace
