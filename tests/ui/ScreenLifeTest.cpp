#include "tests/ui/UiFixture.h"

#include <gmock/gmock.h>

namespace test {
namespace {

using namespace platform;
using testing::ElementsAre;
using testing::IsEmpty;

class ScreenLifeTest : public UiTest {
protected:
    std::shared_ptr<TestScreen> screen(const std::string& name) {
        return std::make_shared<TestScreen>(name, journal);
    }
    /// What was told since the last time.
    Journal told() { return std::exchange(journal, {}); }
};

TEST_F(ScreenLifeTest, ARootScreenLivesThroughItsWindow) {
    const auto list = screen("list");
    window().setRootViewController(list);
    EXPECT_THAT(told(), ElementsAre("list didLoad", "list willAppear", "list didAppear"));
    window().close();
    EXPECT_THAT(told(), ElementsAre("list willDisappear", "list didDisappear"));
}

TEST_F(ScreenLifeTest, APushTellsBothScreensAtItsStartAndAtItsEnd) {
    auto& stack = givenStack(screen("list"));
    told();
    stack.pushViewController(screen("page"), true);
    EXPECT_THAT(told(), ElementsAre("page didLoad", "list willDisappear", "page willAppear"));
    advance(279ms);
    EXPECT_THAT(told(), IsEmpty());
    advance(1ms);
    EXPECT_THAT(told(), ElementsAre("list didDisappear", "page didAppear"));
}

TEST_F(ScreenLifeTest, APopReturnsTheScreenAndTellsBoth) {
    auto& stack = givenStack(screen("list"));
    const auto page = screen("page");
    stack.pushViewController(page, false);
    told();
    EXPECT_EQ(stack.popViewController(true), page);
    advance(280ms);
    EXPECT_THAT(told(), ElementsAre("page willDisappear", "list willAppear", "page didDisappear",
                                    "list didAppear"));
    EXPECT_EQ(page->parentViewController(), nullptr);
    EXPECT_EQ(stack.popViewController(true), nullptr);
}

TEST_F(ScreenLifeTest, AChangeDuringATransitionBringsTheRunningOneToItsEnd) {
    auto& stack = givenStack(screen("list"));
    stack.pushViewController(screen("page"), true);
    advance(100ms);
    told();
    stack.popViewController(true);
    EXPECT_THAT(told(), ElementsAre("list didDisappear", "page didAppear", "page willDisappear",
                                    "list willAppear"));
    advance(280ms);
    EXPECT_THAT(told(), ElementsAre("page didDisappear", "list didAppear"));
}

TEST_F(ScreenLifeTest, AScreenMayPushTheNextWhileItIsToldOfItsAppearance) {
    auto& stack = givenStack(screen("list"));
    const auto first = screen("first");
    const auto second = screen("second");
    first->onWillAppear = [&] { stack.pushViewController(second, true); };
    told();
    stack.pushViewController(first, true);
    advance(280ms);
    EXPECT_EQ(stack.topViewController(), second);
    EXPECT_THAT(told(), ElementsAre("first didLoad", "list willDisappear", "first willAppear",
                                    "list didDisappear", "first didAppear", "second didLoad",
                                    "first willDisappear", "second willAppear",
                                    "first didDisappear", "second didAppear"));
}

TEST_F(ScreenLifeTest, AWholeNewStackShowsItsTopOnly) {
    auto& stack = givenStack(screen("old"));
    told();
    stack.setViewControllers({screen("root"), screen("folder")}, false);
    EXPECT_THAT(told(), ElementsAre("folder didLoad", "old willDisappear", "folder willAppear",
                                    "old didDisappear", "folder didAppear"));
    stack.popViewController(false);
    EXPECT_THAT(told(), ElementsAre("root didLoad", "folder willDisappear", "root willAppear",
                                    "folder didDisappear", "root didAppear"));
}

TEST_F(ScreenLifeTest, AStackBuiltBeforeItIsShownTellsItsTopOnce) {
    const auto stack = std::make_shared<NavigationController>();
    stack->setViewControllers({screen("list"), screen("page")}, true);
    EXPECT_THAT(told(), IsEmpty());
    window().setRootViewController(stack);
    EXPECT_THAT(told(), ElementsAre("page didLoad", "page willAppear", "page didAppear"));
}

TEST_F(ScreenLifeTest, AFullScreenTakesThePlaceOfTheOneBelow) {
    const auto list = screen("list");
    window().setRootViewController(list);
    const auto chooser = screen("chooser");
    bool cameIn = false;
    told();
    list->presentViewController(chooser, true, [&] { cameIn = true; });
    EXPECT_EQ(list->presentedViewController(), chooser);
    EXPECT_EQ(chooser->presentingViewController(), list.get());
    advance(280ms);
    EXPECT_TRUE(cameIn);
    EXPECT_THAT(told(), ElementsAre("chooser didLoad", "list willDisappear", "chooser willAppear",
                                    "chooser didAppear", "list didDisappear"));
    bool wentOut = false;
    chooser->dismissViewController(true, [&] { wentOut = true; });
    EXPECT_EQ(list->presentedViewController(), nullptr);
    advance(280ms);
    EXPECT_TRUE(wentOut);
    EXPECT_THAT(told(), ElementsAre("chooser willDisappear", "list willAppear",
                                    "chooser didDisappear", "list didAppear"));
}

TEST_F(ScreenLifeTest, AnAlertLeavesTheScreensBelowInView) {
    const auto list = screen("list");
    window().setRootViewController(list);
    told();
    const auto alert = AlertController::create("Title", "", AlertStyle::alert);
    alert->addAction(AlertAction::make("OK", ActionStyle::standard));
    list->presentViewController(alert, true);
    advance(180ms);
    list->dismissViewController(true);
    advance(180ms);
    EXPECT_THAT(told(), IsEmpty());
}

TEST_F(ScreenLifeTest, DismissingAScreenBelowTakesAllAboveItAway) {
    const auto list = screen("list");
    window().setRootViewController(list);
    const auto first = screen("first");
    const auto second = screen("second");
    list->presentViewController(first, false);
    first->presentViewController(second, false);
    EXPECT_EQ(second->presentingViewController(), first.get());
    told();
    list->dismissViewController(true);
    advance(280ms);
    EXPECT_EQ(topPresented(), nullptr);
    EXPECT_THAT(told(), ElementsAre("second willDisappear", "list willAppear",
                                    "second didDisappear", "list didAppear"));
}

TEST_F(ScreenLifeTest, AChildAppearsWithItsParentOrWhenItIsAdded) {
    const auto list = screen("list");
    const auto early = screen("early");
    list->addChildViewController(early);
    list->view()->addSubview(early->view());
    early->didMoveToParent(list.get());
    told();
    window().setRootViewController(list);
    EXPECT_THAT(told(), ElementsAre("list willAppear", "early willAppear", "list didAppear",
                                    "early didAppear"));
    const auto late = screen("late");
    list->addChildViewController(late);
    list->view()->addSubview(late->view());
    late->didMoveToParent(list.get());
    EXPECT_THAT(told(), ElementsAre("late didLoad", "late willAppear", "late didAppear"));
    late->removeFromParentViewController();
    EXPECT_THAT(told(), ElementsAre("late willDisappear", "late didDisappear"));
}

TEST_F(ScreenLifeTest, ReducedMotionEndsEveryTransitionAtOnce) {
    application().setReducesMotion(true);
    auto& stack = givenStack(screen("list"));
    told();
    stack.pushViewController(screen("page"), true);
    EXPECT_THAT(told(), ElementsAre("page didLoad", "list willDisappear", "page willAppear",
                                    "list didDisappear", "page didAppear"));
}

} // namespace
} // namespace test
