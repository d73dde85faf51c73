// A list as people and programs use it: what it tells, what it shows in place of rows, how it keeps
// place and selection.

#include "tests/documents/ListFixture.h"

#include <atomic>
#include <thread>
#include <unistd.h>

using namespace platform;
using namespace std::chrono_literals;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

namespace {

using List = test::ListFixture;

TEST_F(List, tellsItsDelegateOfChangesOnceATurn) {
    open();
    showList();
    EXPECT_EQ(delegate->changes, 1) << "the first reading is a report as well";
    list->setEditing(true, false);
    house.givenFile("a.txt");
    house.givenFile("b.txt");
    ASSERT_TRUE(untilShown({"a.txt", "b.txt"}));
    house.settle();
    delegate->changes = 0;
    list->setSelectedItems({house.url("a.txt")});
    list->setSelectedItems({house.url("b.txt")});
    list->setSelectedItems({house.url("b.txt")});
    EXPECT_EQ(delegate->changes, 0);
    house.settle();
    EXPECT_EQ(delegate->changes, 1);
}

TEST_F(List, opensFoldersWithANewListAndDocumentsByTheirURL) {
    open();
    house.givenFile("Trip/a.txt");
    house.givenFile("Notes.txt");
    showList();
    tap("Trip");
    tap("Notes.txt");
    EXPECT_THAT(delegate->folders, ElementsAre(house.url("Trip")));
    EXPECT_THAT(delegate->files, ElementsAre(house.url("Notes.txt")));
}

TEST_F(List, selectsInEditModeInsteadOfOpening) {
    open();
    givenFiles(6);
    showList();
    list->setEditing(true, true);
    house.advance(1s);
    tap("File 1.txt");
    tap("File 4.txt", Qt::ShiftModifier);
    tap("File 2.txt");
    EXPECT_THAT(selected(), ElementsAre("File 1.txt", "File 3.txt", "File 4.txt"));
    EXPECT_THAT(delegate->files, IsEmpty());
    list->setEditing(false, true);
    EXPECT_THAT(selected(), IsEmpty());
}

TEST_F(List, theSelectionFollowsRenamesAndLosesWhatIsGone) {
    open();
    givenFiles(4);
    showList();
    list->setEditing(true, false);
    list->setSelectedItems({house.url("File 1.txt"), house.url("File 2.txt")});
    house.rename("File 1.txt", "Zebra.txt");
    house.remove("File 2.txt");
    ASSERT_TRUE(untilShown({"File 0.txt", "File 3.txt", "Zebra.txt"}));
    EXPECT_THAT(selected(), ElementsAre("Zebra.txt"));
    house.givenFile("File 2.txt");
    house.until([&] { return list->containedItemCount() == 4; });
    EXPECT_THAT(selected(), ElementsAre("Zebra.txt")) << "a new file of that name is another one";
}

TEST_F(List, keepsTheScrollPlaceWhileRowsComeGoAndMove) {
    open();
    givenFiles(60);
    showList();
    state().scrolling.jumpTo(1500);
    const std::string top = nameAtTop();
    const double y = yOf(top);
    for (int i = 0; i < 5; ++i)
        house.givenFile("A new one " + std::to_string(i));
    house.remove("File 3.txt");
    ASSERT_TRUE(house.until([&] { return list->containedItemCount() == 64; }));
    EXPECT_EQ(yOf(top), y);
    house.rename(top, "A renamed one");
    ASSERT_TRUE(house.until([&] { return shown()[5] == "A renamed one"; }));
    EXPECT_NE(nameAtTop(), "A renamed one") << "the view does not follow one row to the top";
}

TEST_F(List, showsWhatComesInWhileItStandsAtTheTop) {
    open();
    givenFiles(60);
    showList();
    house.givenFile("A new one");
    ASSERT_TRUE(house.until([&] { return list->containedItemCount() == 61; }));
    EXPECT_EQ(nameAtTop(), "A new one");
}

TEST_F(List, keepsItsScrollPlaceUnderAnotherScreen) {
    open();
    givenFiles(60);
    showList();
    state().scrolling.jumpTo(1200);
    house.navigation->pushViewController(std::make_shared<ViewController>(), false);
    house.advance(1s);
    house.navigation->popViewController(false);
    house.advance(1s);
    EXPECT_EQ(state().scrolling.offset(), 1200);
}

TEST_F(List, aFingerFlingsItAndItComesToRest) {
    open();
    givenFiles(100);
    showList();
    drag({100, 400}, {100, 200});
    const double let = state().scrolling.offset();
    EXPECT_GT(let, 150);
    EXPECT_TRUE(state().scrolling.isMoving());
    house.advance(3s);
    EXPECT_GT(state().scrolling.offset(), let + 100);
    EXPECT_FALSE(state().scrolling.isMoving());
    EXPECT_THAT(delegate->files, IsEmpty()) << "scrolling opens nothing";
}

TEST_F(List, drawnBeyondItsEndItReturns) {
    open();
    givenFiles(100);
    showList();
    state().scrolling.jumpTo(1e9);
    const double end = state().scrolling.offset();
    drag({100, 400}, {100, 300}, 200ms);
    house.advance(1s);
    EXPECT_EQ(state().scrolling.offset(), end);
}

TEST_F(List, pullingDownBringsInWhatIsNewInTheCloud) {
    open();
    house.givenFile("a.txt");
    showList();
    house.givenRemote("from elsewhere.txt");
    drag({100, 100}, {100, 420}, 50ms);
    EXPECT_TRUE(untilShown({"a.txt", "from elsewhere.txt"}));
    EXPECT_TRUE(house.until([&] { return !widget().isRefreshing(); }));
}

TEST_F(List, saysThatAFolderIsEmptyOnlyWhenItIs) {
    open();
    house.givenFolder("Empty");
    list = DocumentListController::createForURL(house.url("Empty"));
    ASSERT_TRUE(list->view());
    EXPECT_EQ(list->impl().list->page(), nullptr) << "nothing is known of it yet";
    house.show({list});
    ASSERT_TRUE(house.until([&] { return list->impl().list->page() != nullptr; }));
    EXPECT_EQ(list->impl().list->page()->title(), "No documents here");
    house.givenFile("Empty/now.txt");
    EXPECT_TRUE(house.until([&] { return list->impl().list->page() == nullptr; }));
}

TEST_F(List, aFolderThatVanishesLeavesAPageThatSaysSoAndMayComeBack) {
    open();
    house.givenFile("Trip/a.txt");
    showList("Trip");
    house.remove("Trip");
    ASSERT_TRUE(house.until([&] { return list->impl().list->page() != nullptr; }));
    EXPECT_EQ(list->impl().list->page()->title(), "This folder is no longer here");
    EXPECT_THAT(list->impl().list->page()->message(), ::testing::HasSubstr("Trip"));
    EXPECT_THAT(list->containedItems(), IsEmpty());
    house.givenFile("Trip/b.txt");
    EXPECT_TRUE(house.until([&] { return list->impl().list->page() == nullptr; }));
}

TEST_F(List, aRowShowsHowFarItsContentHasArrived) {
    house.givenRemote("Big.bin");
    open();
    showList();
    auto progress = std::make_shared<Progress>(std::string(fileProgressKind), 100);
    auto published = house.platform->fileProgress().publish(house.url("Big.bin"), progress);
    progress->update(40, 100);
    ASSERT_TRUE(house.until([&] { return state().lookOf(0).progress == 0.4; }));
    published.reset();
    EXPECT_TRUE(house.until([&] { return !state().lookOf(0).progress; }));
}

TEST_F(List, hostileNamesAreShownHarmlessly) {
    open();
    const std::string longest(251, 'n');
    for (const std::string& name :
         {std::string("evil\u202egpj.exe"), std::string("two\nlines"), std::string("bad\xff\xfe"),
          std::string("Case"), std::string("case"), std::string("Caf\u00E9"),
          std::string("Cafe\u0301"), longest + ".txt"})
        house.givenFile(name);
    showList();
    EXPECT_EQ(list->containedItemCount(), 8U);
    EXPECT_EQ(accessibleRow("evil\u202egpj.exe")->text(QAccessible::Name),
              QStringLiteral("evil\uFFFDgpj.exe"));
    EXPECT_EQ(accessibleRow("two\nlines")->text(QAccessible::Name), QStringLiteral("two␊lines"));
    tap("bad\xff\xfe");
    EXPECT_THAT(delegate->files, ElementsAre(house.url("bad\xff\xfe")));
    house.savePicture(house.home / "hostile.png", 1);
    const QString& painted =
        state().contents.at(state().model, rowNamed(longest + ".txt")).fittingName;
    EXPECT_TRUE(painted.contains(QStringLiteral(".txt"))) << painted.toStdString();
}

TEST_F(List, theHierarchyGoesFromTheRootToTheFolder) {
    house.givenRemote("/Sketches/.container.json",
                      R"({"identifier":"com.example.draw","names":{"en":"My Sketches"},)"
                      R"("documents":"Files"})");
    house.givenRemote("/Sketches/Files/2026/May/a.txt");
    open();
    const auto hierarchy = [&](std::string_view folder) {
        std::vector<std::string> titles;
        if (const auto lists =
                DocumentListController::listControllerHierarchyForURL(house.url(folder)))
            for (const auto& each : *lists)
                titles.push_back(each->title());
        return titles;
    };
    EXPECT_THAT(hierarchy("/Sketches/Files/2026/May"),
                ElementsAre("Tavrin", "My Sketches", "2026", "May"));
    EXPECT_THAT(hierarchy("/Sketches/Files/2026/../2026"),
                ElementsAre("Tavrin", "My Sketches", "2026"));
    EXPECT_THAT(hierarchy("/Sketches"), ElementsAre("Tavrin", "My Sketches"));
    EXPECT_THAT(hierarchy("/"), ElementsAre("Tavrin"));
    EXPECT_THAT(hierarchy("/Sketches/Files/None"), IsEmpty());
    EXPECT_FALSE(DocumentListController::listControllerHierarchyForURL(Url::file("/usr")));
}

TEST_F(List, thereIsNoRootListWithoutAStore) {
    house.withoutAccount();
    EXPECT_EQ(DocumentListController::create(), nullptr);
    EXPECT_FALSE(DocumentListController::listControllerHierarchyForURL(Url::file("/")));
}

TEST_F(List, mayGoAwayInTheMiddleOfAnything) {
    open();
    givenFiles(2000);
    for (int i = 0; i < 5; ++i) {
        list = house.showList();
        list->setDelegate(delegate);
        house.givenFile("More " + std::to_string(i));
        house.show({});
        list.reset();
    }
    showList();
    EXPECT_EQ(list->containedItemCount(), 2005U);
}

TEST_F(List, aStormOfAHundredThousandChangesLeavesPlaceAndSelection) {
    open();
    house.givenManyFiles("Big", 2000);
    showList("Big");
    list->setEditing(true, false);
    list->setSelectedItems({house.url("Big/IMG 1000.jpg"), house.url("Big/IMG 1500.jpg")});
    state().reveal(rowNamed("IMG 1200.jpg"), false);
    const double y = yOf("IMG 1200.jpg");
    std::atomic<bool> over = false;
    std::thread storm([&, folder = house.path("Big/")] {
        const std::string original = folder + "IMG 0.jpg";
        for (int i = 0; i < 52'000; ++i)
            EXPECT_EQ(::link(original.c_str(), (folder + "A " + std::to_string(i)).c_str()), 0);
        for (int i = 0; i < 50'000; ++i)
            EXPECT_EQ(::unlink((folder + "A " + std::to_string(i)).c_str()), 0);
        over = true;
    });
    while (!over)
        house.until([&] { return over.load(); });
    storm.join();
    EXPECT_TRUE(house.until([&] {
        return list->containedItemCount() == 4000 && state().model.entryAt(0).name == "A 50000";
    }));
    EXPECT_EQ(yOf("IMG 1200.jpg"), y);
    EXPECT_THAT(selected(), ElementsAre("IMG 1000.jpg", "IMG 1500.jpg"));
}

TEST_F(List, aHundredThousandEntriesScrollSelectAndTakeOneMore) {
    open();
    house.givenManyFiles("Big", 100'000);
    showList("Big");
    EXPECT_EQ(list->containedItemCount(), 100'000U);
    press(Qt::Key_End);
    EXPECT_EQ(currentName(), "IMG 99999.jpg");
    EXPECT_EQ(state().scrolling.offset(), state().scrolling.maximum());
    const RowId middle = state().model.idAt(50'000);
    house.givenFile("Big/IMG 2b.jpg");
    ASSERT_TRUE(house.until([&] { return list->containedItemCount() == 100'001; }));
    EXPECT_EQ(state().model.entryAt(3).name, "IMG 2b.jpg");
    EXPECT_EQ(state().model.indexOf(middle), 50'001U);
    list->setEditing(true, false);
    press(Qt::Key_A, Qt::ControlModifier);
    EXPECT_EQ(list->selectedItemCount(), 100'001U);
    EXPECT_EQ(list->selectedItems().size(), 100'001U);
}

} // namespace
