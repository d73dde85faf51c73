// Keyboard, swipes, menus and screen readers on a list, in both reading directions.

#include "platform/ui/AlertController.h"
#include "tests/documents/ListFixture.h"

#include <QApplication>
#include <QContextMenuEvent>
#include <QCoreApplication>
#include <QMouseEvent>
#include <QTest>
#include <QWheelEvent>

using namespace platform;
using namespace std::chrono_literals;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

namespace {

struct Input : test::ListFixture {
    void SetUp() override {
        open();
        givenFiles(40);
        showList();
        widget().setFocus();
    }
    std::shared_ptr<AlertController> sheet() const {
        const auto presented = house.navigation->presentedViewController();
        return std::dynamic_pointer_cast<AlertController>(
            presented ? presented : list->presentedViewController());
    }
    std::vector<std::string> sheetTitles() const {
        std::vector<std::string> titles;
        if (sheet())
            for (const auto& action : sheet()->actions())
                titles.push_back(action->title());
        return titles;
    }
    Point actionCentre(int action, std::string_view name) const {
        const Rect row = state().rowRect(rowNamed(name));
        const Rect button = state().swipe.buttonRect(action, row.size());
        const double x = state().style.rightToLeft ? row.width - button.midX() : button.midX();
        return {x, row.midY()};
    }
};

TEST_F(Input, arrowsAndPagesMoveTheCurrentRowAndKeepItInView) {
    press(Qt::Key_Home);
    press(Qt::Key_Down);
    EXPECT_EQ(currentName(), "File 1.txt");
    press(Qt::Key_PageDown);
    press(Qt::Key_PageDown);
    const Rect row = state().rowRect(*state().indexOf(state().current));
    EXPECT_GE(row.y, 0);
    EXPECT_LE(row.maxY(), state().size.height);
    press(Qt::Key_End);
    EXPECT_EQ(currentName(), "File 39.txt");
    press(Qt::Key_Up);
    EXPECT_EQ(currentName(), "File 38.txt");
    press(Qt::Key_Home);
    EXPECT_EQ(state().scrolling.offset(), 0);
}

TEST_F(Input, aPressOnTheEmptyBarLeavesTheKeysToTheList) {
    press(Qt::Key_Home);
    QTest::mouseClick(widget().window(), Qt::LeftButton, {}, QPoint(200, 30));
    ASSERT_EQ(QApplication::focusWidget(), &widget());
}

TEST_F(Input, enterOpensAndF2AndDeleteAskForTheirActions) {
    press(Qt::Key_Home);
    press(Qt::Key_Return);
    press(Qt::Key_F2);
    press(Qt::Key_Delete);
    EXPECT_THAT(delegate->files, ElementsAre(house.url("File 0.txt")));
    ASSERT_EQ(delegate->actions.size(), 2U);
    EXPECT_EQ(delegate->actions[0].number, 3);
    EXPECT_EQ(delegate->actions[1].number, 0);
    EXPECT_EQ(delegate->actions[1].url, house.url("File 0.txt"));
    list->setAvailableActions(1U << 3);
    press(Qt::Key_Delete);
    EXPECT_EQ(delegate->actions.size(), 2U) << "what is not offered is not done by a key either";
}

TEST_F(Input, enterOpensTheFirstRowThatComesIntoAnEmptyList) {
    house.givenFolder("Empty");
    showList("Empty");
    widget().setFocus();
    house.givenFile("Empty/First.txt");
    ASSERT_TRUE(untilShown({"First.txt"}));
    press(Qt::Key_Return);
    EXPECT_THAT(delegate->files, ElementsAre(house.url("Empty/First.txt")));
}

TEST_F(Input, typingFindsANameAndAPauseBeginsAnother) {
    house.givenFile("Zebra.txt");
    ASSERT_TRUE(house.until([&] { return list->containedItemCount() == 41; }));
    type("file 3");
    EXPECT_EQ(currentName(), "File 3.txt");
    type("1");
    EXPECT_EQ(currentName(), "File 31.txt");
    house.advance(2s);
    type("z");
    EXPECT_EQ(currentName(), "Zebra.txt");
}

TEST_F(Input, spaceShiftAndControlASelectInEditModeAlone) {
    press(Qt::Key_Home);
    press(Qt::Key_Space);
    press(Qt::Key_A, Qt::ControlModifier);
    EXPECT_THAT(selected(), IsEmpty());
    list->setEditing(true, false);
    press(Qt::Key_Space);
    press(Qt::Key_Down, Qt::ShiftModifier);
    press(Qt::Key_Down, Qt::ShiftModifier);
    EXPECT_THAT(selected(), ElementsAre("File 0.txt", "File 1.txt", "File 2.txt"));
    press(Qt::Key_Up, Qt::ShiftModifier);
    EXPECT_THAT(selected(), ElementsAre("File 0.txt", "File 1.txt")) << "a range may shrink";
    press(Qt::Key_A, Qt::ControlModifier);
    EXPECT_EQ(list->selectedItemCount(), 40U);
}

TEST_F(Input, escapePressesTheScreensCancelButtonInEditMode) {
    bool cancelled = false;
    list->navigationItem().setRightBarButtonItem(BarButtonItem::withSystemItem(
        SystemItem::cancel, [&](BarButtonItem&) { cancelled = true; }));
    EXPECT_FALSE(list->performKeyCommand(KeyCommand::cancel));
    list->setEditing(true, false);
    press(Qt::Key_Escape);
    EXPECT_TRUE(cancelled);
}

TEST_F(Input, aSwipeRevealsTheOfferedActionsAndATapOnOneReportsIt) {
    swipe("File 1.txt");
    ASSERT_TRUE(state().swipe.isOpen());
    tap(actionCentre(2, "File 1.txt"));
    ASSERT_EQ(delegate->actions.size(), 1U);
    const auto& action = delegate->actions[0];
    EXPECT_EQ(action.number, 2);
    EXPECT_EQ(action.url, house.url("File 1.txt"));
    ASSERT_TRUE(action.view);
    EXPECT_EQ(action.view->window(), house.window.get());
    EXPECT_GT(action.view->bounds().width, 0);
    EXPECT_TRUE(state().lookOf(1).pressed) << "marked until it is dealt with";
    action.completion();
    EXPECT_FALSE(state().lookOf(1).pressed);
    house.advance(1s);
    EXPECT_FALSE(state().swipe.row());
}

TEST_F(Input, anOpenSwipeClosesAtAnyOtherTapWhichOpensNothing) {
    swipe("File 1.txt");
    tap("File 4.txt");
    house.advance(1s);
    EXPECT_FALSE(state().swipe.row());
    EXPECT_THAT(delegate->files, IsEmpty());
}

TEST_F(Input, aRowThatGoesUnderTheFingerIsNeitherOpenedNorSwiped) {
    const Point at = middleOf("File 1.txt");
    fingerDown(at);
    house.remove("File 1.txt");
    ASSERT_TRUE(house.until([&] { return list->containedItemCount() == 39; }));
    fingerTo({at.x - 120, at.y});
    fingerUp({at.x - 120, at.y});
    EXPECT_FALSE(state().swipe.row());
    EXPECT_THAT(delegate->files, IsEmpty());
    tap("File 2.txt");
    EXPECT_THAT(delegate->files, ElementsAre(house.url("File 2.txt")));
}

TEST_F(Input, aShortSwipeSpringsBackAndOneInEditModeDoesNothing) {
    swipe("File 1.txt", 60, 50ms);
    EXPECT_FALSE(state().swipe.row());
    list->setEditing(true, false);
    swipe("File 1.txt");
    EXPECT_FALSE(state().swipe.row());
}

TEST_F(Input, readingFromTheRightSwipesAndPlacesEverythingTheOtherWay) {
    house.application->setRightToLeft(true);
    house.settle();
    swipe("File 1.txt");
    ASSERT_TRUE(state().swipe.isOpen());
    const Point remove = actionCentre(0, "File 1.txt");
    EXPECT_LT(remove.x, 100) << "the trailing edge is the left one";
    tap(remove);
    ASSERT_EQ(delegate->actions.size(), 1U);
    EXPECT_EQ(delegate->actions[0].number, 0);
    EXPECT_LT(state().moreRect(2).x, 60);
}

TEST_F(Input, moreOffersTheSameActionsAsASheet) {
    tap(state().moreRect(3).center());
    house.advance(1s);
    EXPECT_THAT(sheetTitles(), ElementsAre("Info", "Rename", "More", "Delete", "Cancel"));
    sheet()->choose(sheet()->actions()[1]);
    house.advance(1s);
    ASSERT_EQ(delegate->actions.size(), 1U);
    EXPECT_EQ(delegate->actions[0].number, 3);
    EXPECT_EQ(delegate->actions[0].url, house.url("File 3.txt"));
}

TEST_F(Input, aLongPressAndTheMenuKeyOpenTheSheet) {
    list->setAvailableActions(1);
    press(Qt::Key_Home);
    QContextMenuEvent menu(QContextMenuEvent::Keyboard, {}, {});
    QCoreApplication::sendEvent(&widget(), &menu);
    house.advance(1s);
    EXPECT_THAT(sheetTitles(), ElementsAre("Delete", "Cancel"));
    sheet()->choose(sheet()->actions()[1]);
    house.advance(1s);
    EXPECT_EQ(sheet(), nullptr);
    EXPECT_FALSE(state().lookOf(0).pressed);
    const QPointF at(100, middleOf("File 2.txt").y);
    QMouseEvent down(QEvent::MouseButtonPress, at, at, Qt::LeftButton, Qt::LeftButton, {});
    QCoreApplication::sendEvent(&widget(), &down);
    house.advance(600ms);
    EXPECT_THAT(sheetTitles(), ElementsAre("Delete", "Cancel"));
    QMouseEvent up(QEvent::MouseButtonRelease, at, at, Qt::LeftButton, Qt::NoButton, {});
    QCoreApplication::sendEvent(&widget(), &up);
    EXPECT_THAT(delegate->files, IsEmpty());
}

TEST_F(Input, aScreenReaderSeesNamedRowsAndCanDoWhatPeopleDo) {
    QAccessibleInterface* const whole = QAccessible::queryAccessibleInterface(&widget());
    ASSERT_TRUE(whole);
    EXPECT_EQ(whole->role(), QAccessible::List);
    EXPECT_EQ(whole->childCount(), 40);
    QAccessibleInterface* const row = accessibleRow("File 2.txt");
    EXPECT_EQ(row->role(), QAccessible::ListItem);
    EXPECT_EQ(row->text(QAccessible::Name), QStringLiteral("File 2.txt"));
    EXPECT_TRUE(house.until([&] {
        return row->text(QAccessible::Description).contains(QStringLiteral("1 byte"));
    })) << row->text(QAccessible::Description).toStdString();
    EXPECT_EQ(whole->indexOfChild(row), 2);
    EXPECT_TRUE(accessibleRow("File 39.txt")->state().offscreen);
    row->actionInterface()->doAction(QAccessibleActionInterface::pressAction());
    EXPECT_THAT(delegate->files, ElementsAre(house.url("File 2.txt")));
    row->actionInterface()->doAction(QStringLiteral("Delete"));
    ASSERT_EQ(delegate->actions.size(), 1U);
    EXPECT_EQ(delegate->actions[0].number, 0);
    list->setEditing(true, false);
    row->actionInterface()->doAction(QAccessibleActionInterface::pressAction());
    EXPECT_TRUE(row->state().selected);
}

TEST_F(Input, aScreenReadersRowOfAFileThatIsGoneIsInvalid) {
    QAccessibleInterface* const row = accessibleRow("File 2.txt");
    const QAccessible::Id id = QAccessible::uniqueId(row);
    house.remove("File 2.txt");
    ASSERT_TRUE(house.until([&] { return list->containedItemCount() == 39; }));
    QAccessibleInterface* const now = QAccessible::accessibleInterface(id);
    EXPECT_TRUE(!now || !now->isValid());
}

TEST_F(Input, theWheelScrollsSmoothlyAndNotBeyondTheEnds) {
    QWheelEvent turn({100, 100}, {100, 100}, {}, {0, -240}, Qt::NoButton, Qt::NoModifier,
                     Qt::NoScrollPhase, false);
    QCoreApplication::sendEvent(&widget(), &turn);
    house.advance(1s);
    EXPECT_GT(state().scrolling.offset(), 100);
    QWheelEvent back({100, 100}, {100, 100}, {}, {0, 2400}, Qt::NoButton, Qt::NoModifier,
                     Qt::NoScrollPhase, false);
    QCoreApplication::sendEvent(&widget(), &back);
    house.advance(1s);
    EXPECT_EQ(state().scrolling.offset(), 0);
}

TEST_F(Input, rowsGrowWithTheUsersTextAndTheDetailsStayWhole) {
    house.application->setTextScale(2);
    house.advance(1s);
    house.savePicture(house.home / "large.png", 1);
    EXPECT_GE(state().style.rowHeight, 90);
    const RowContent& content = state().contents.at(state().model, 0);
    EXPECT_FALSE(content.fittingDetails.isEmpty());
    EXPECT_FALSE(content.fittingDetails.contains(QChar(0x2026))) << "shortened, not cut";
}

} // namespace
