#include "tests/ui/UiFixture.h"

#include <gmock/gmock.h>

namespace test {
namespace {

using namespace platform;
using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Not;

class Listener : public NavigationControllerDelegate {
public:
    explicit Listener(Journal& journal) : journal_(journal) {}
    void navigationControllerWillShowViewController(NavigationController&, ViewController& screen,
                                                    bool) override {
        journal_.push_back("willShow " + screen.title());
    }
    void navigationControllerDidShowViewController(NavigationController&, ViewController& screen,
                                                   bool) override {
        journal_.push_back("didShow " + screen.title());
    }

private:
    Journal& journal_;
};

class NavigationTest : public UiTest {
protected:
    NavigationTest() { givenStack(screen("Documents")); }

    std::shared_ptr<TestScreen> screen(const std::string& title) {
        return std::make_shared<TestScreen>(title, journal);
    }
    std::shared_ptr<TestScreen> givenPushed(const std::string& title) {
        auto pushed = screen(title);
        stack().pushViewController(pushed, false);
        settle();
        journal.clear();
        return pushed;
    }
    NavigationController& stack() {
        return static_cast<NavigationController&>(*window().rootViewController());
    }
    /// Where the middle of the screen's view stands from side to side.
    double middleOf(ViewController& shown) {
        return shown.view()->convertToWindow(shown.view()->bounds()).midX();
    }
    Rect frameOf(View& view) { return view.convertToWindow(view.bounds()); }
};

TEST_F(NavigationTest, TheBackButtonNamesTheScreenBelowAndPops) {
    givenPushed("Report");
    ASSERT_NE(button("Documents"), nullptr);
    stack().viewControllers().front()->navigationItem().setTitle("Folder");
    tap(*button("Folder"));
    advance(280ms);
    EXPECT_EQ(stack().topViewController()->title(), "Documents");
    EXPECT_EQ(button("Folder"), nullptr);
}

TEST_F(NavigationTest, ALongTitleLeavesTheBackButtonItsArrowAndElidesInTheMiddle) {
    givenPushed("Quarterly report of the northern branches, revised.pdf");
    EXPECT_EQ(button("Documents")->frame().width, 44);
    EXPECT_FALSE(window().layoutIfNeeded()) << "the layout has come to rest";
    Label* const title = label("Quarterly report of the northern branches, revised.pdf");
    ASSERT_NE(title, nullptr);
    EXPECT_TRUE(title->isTruncated());
    window().resize({1000, 800});
    EXPECT_FALSE(title->isTruncated());
    EXPECT_NEAR(frameOf(*title).midX(), 500, 1);
}

TEST_F(NavigationTest, ChangesOfTheTopItemShowAtOnce) {
    const auto page = givenPushed("Report");
    page->navigationItem().setTitle("Select Items");
    page->navigationItem().setHidesBackButton(true, false);
    bool cancelled = false;
    page->navigationItem().setRightBarButtonItem(BarButtonItem::withSystemItem(
        SystemItem::cancel, [&](BarButtonItem&) { cancelled = true; }));
    EXPECT_THAT(buttonTitles(), ElementsAre("Cancel"));
    EXPECT_NE(label("Select Items"), nullptr);
    tap(*button("Cancel"));
    EXPECT_TRUE(cancelled);
    press(Key::altLeft);
    EXPECT_EQ(stack().topViewController(), page) << "no way back while it is hidden";
}

TEST_F(NavigationTest, AltLeftGoesBack) {
    givenPushed("Report");
    press(Key::tab);
    press(Key::altLeft);
    EXPECT_EQ(stack().topViewController()->title(), "Documents");
}

TEST_F(NavigationTest, TheDelegateHearsBeforeAndAfterEveryChangeOfTheTop) {
    const auto listener = std::make_shared<Listener>(journal);
    journal.clear();
    stack().setDelegate(listener);
    stack().pushViewController(screen("Report"), true);
    EXPECT_THAT(journal, Contains("willShow Report"));
    EXPECT_THAT(journal, Not(Contains("didShow Report")));
    advance(280ms);
    EXPECT_EQ(journal.back(), "didShow Report");
    journal.clear();
    stack().setViewControllers({screen("Other")}, false);
    EXPECT_EQ(journal.back(), "didShow Other");
}

TEST_F(NavigationTest, ThePageComesFromTheTrailingSideAndTheLowerGoesAThirdOfTheWay) {
    const auto list = stack().topViewController();
    for (const bool rightToLeft : {false, true}) {
        application().setRightToLeft(rightToLeft);
        const auto page = screen("Report");
        stack().pushViewController(page, true);
        const double width = window().size().width;
        const double sign = rightToLeft ? -1 : 1;
        EXPECT_NEAR(middleOf(*page), width / 2 + sign * width, 1);
        advance(140ms);
        // Half of the time, eased out: 1 - (1/2)^3 of the way, but for a frame.
        EXPECT_NEAR(middleOf(*page), width / 2 + sign * width / 8, 10);
        EXPECT_NEAR(middleOf(*list), width / 2 - sign * width * 7 / 8 / 3, 4);
        advance(140ms);
        EXPECT_NEAR(middleOf(*page), width / 2, 0.5);
        stack().popViewController(false);
    }
}

TEST_F(NavigationTest, AFingerFromTheLeadingEdgeDrawsThePageAway) {
    const auto page = givenPushed("Report");
    fingerDown({4, 400});
    fingerTo({60, 402});
    fingerTo({300, 405});
    EXPECT_NEAR(middleOf(*page), 195 + 296, 2);
    EXPECT_THAT(journal, IsEmpty()) << "nobody is told before the finger is lifted";
    fingerUp({300, 405});
    EXPECT_EQ(stack().topViewController()->title(), "Documents");
    advance(280ms);
    EXPECT_THAT(journal, ElementsAre("Report willDisappear", "Documents willAppear",
                                     "Report didDisappear", "Documents didAppear"));
}

TEST_F(NavigationTest, AFingerThatGoesBackLeavesNoTrace) {
    const auto page = givenPushed("Report");
    int presses = 0;
    auto row = std::make_shared<Button>(ButtonType::system, Rect{0, 0, 390, 400});
    row->addAction(ControlEvent::touchUpInside, [&] { ++presses; });
    page->view()->addSubview(row);
    fingerDown({4, 200});
    fingerTo({80, 200});
    fingerTo({30, 200});
    fingerUp({30, 200});
    advance(280ms);
    EXPECT_EQ(stack().topViewController(), page);
    EXPECT_THAT(journal, IsEmpty());
    EXPECT_EQ(presses, 0) << "the press below the finger was taken back";
    EXPECT_NEAR(middleOf(*page), 195, 0.5);
    tapAt({100, 200});
    EXPECT_EQ(presses, 1);
}

TEST_F(NavigationTest, ASwipeNeedsTheEdgeAndAWayBack) {
    const auto page = givenPushed("Report");
    const auto swipeFrom = [&](double x) {
        fingerDown({x, 400});
        fingerTo({x + 60, 400});
        fingerTo({x + 250, 400});
        fingerUp({x + 250, 400});
        advance(280ms);
    };
    swipeFrom(60);
    EXPECT_EQ(stack().topViewController(), page);
    page->navigationItem().setHidesBackButton(true, false);
    swipeFrom(4);
    EXPECT_EQ(stack().topViewController(), page);
}

TEST_F(NavigationTest, TheToolbarSharesItsRoomBetweenFlexibleSpaces) {
    const auto page = givenPushed("Report");
    const auto space = BarButtonItem::withSystemItem(SystemItem::flexibleSpace);
    const auto first = BarButtonItem::withTitle("New Folder", BarStyle::plain, {});
    const auto last = BarButtonItem::withSystemItem(SystemItem::trash);
    auto status = std::make_shared<Label>();
    status->setText("12 items");
    page->setToolbarItems({first, space, BarButtonItem::withCustomView(status), space, last});
    stack().setToolbarHidden(false, false);
    settle();
    const double before = frameOf(*status).x - frameOf(*first->shownView()).maxX();
    const double after = frameOf(*last->shownView()).x - frameOf(*status).maxX();
    EXPECT_NEAR(before, after, 1.5);
    EXPECT_NEAR(frameOf(*last->shownView()).maxX(), 390 - 4, 1);
    status->setText("12 items, 1.5 GB available");
    settle();
    EXPECT_FALSE(status->isTruncated()) << "the bar follows its custom view";
    stack().setToolbarHidden(true, true);
    EXPECT_TRUE(stack().isToolbarHidden());
    advance(280ms);
    EXPECT_GE(stack().view()->frame().maxY(), 844);
}

TEST_F(NavigationTest, BarItemsAreEnabledAndPressedAliveInTheBar) {
    const auto page = givenPushed("Report");
    int presses = 0;
    const auto move =
        BarButtonItem::withTitle("Move", BarStyle::plain, [&](BarButtonItem&) { ++presses; });
    page->setToolbarItems({move});
    stack().setToolbarHidden(false, false);
    move->setEnabled(false);
    tap(*button("Move"));
    move->perform();
    EXPECT_EQ(presses, 0);
    move->setEnabled(true);
    tap(*button("Move"));
    EXPECT_EQ(presses, 1);
    page->setToolbarItems({});
    EXPECT_EQ(move->shownView(), nullptr);
}

TEST_F(NavigationTest, AScreenStandsBetweenTheBarsOrReachesUnderThem) {
    const auto page = givenPushed("Report");
    stack().setToolbarHidden(false, false);
    settle();
    EXPECT_EQ(frameOf(*page->view()), (Rect{0, 72, 390, 844 - 72 - 48}));
    EXPECT_EQ(stack().navigationBarFrame(), (Rect{0, 20, 390, 52}));
    EXPECT_EQ(stack().toolbarFrame(), (Rect{0, 844 - 48, 390, 48}));
    page->setExtendsUnderBars(true);
    settle();
    EXPECT_EQ(frameOf(*page->view()), (Rect{0, 0, 390, 844}));
}

} // namespace
} // namespace test
