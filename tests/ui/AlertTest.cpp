#include "tests/ui/UiFixture.h"

#include <gmock/gmock.h>

namespace test {
namespace {

using namespace platform;
using testing::ElementsAre;
using testing::IsEmpty;

class AlertTest : public UiTest {
protected:
    AlertAction::Pointer action(const std::string& title,
                                ActionStyle style = ActionStyle::standard) {
        // A choice may end after the test's own members have gone.
        return AlertAction::make(
            title, style, [&log = journal](AlertAction& chosen) { log.push_back(chosen.title()); });
    }
    std::shared_ptr<AlertController> alert(const std::vector<AlertAction::Pointer>& actions,
                                           AlertStyle style = AlertStyle::alert) {
        auto made = AlertController::create("Title", "Message", style);
        for (const auto& each : actions)
            made->addAction(each);
        return made;
    }
    void present(const std::shared_ptr<AlertController>& shown) {
        window().rootViewController()->presentViewController(shown, true);
        advance(280ms);
    }
    /// Shown, with the way out first as a prompt has it.
    std::shared_ptr<AlertController> givenPrompt(const AlertAction::Pointer& done) {
        auto prompt = alert({action("Cancel"), done});
        prompt->addTextField([](TextField& field) { field.setText("Report"); });
        present(prompt);
        return prompt;
    }
    Rect rectOf(const View& view) { return view.convertToWindow(view.bounds()); }

    Journal& answers = journal;
};

TEST_F(AlertTest, AnActionDismissesAndThenAnswers) {
    const auto shown = alert({action("OK")});
    present(shown);
    tap(*button("OK"));
    EXPECT_EQ(topPresented(), nullptr);
    EXPECT_THAT(answers, IsEmpty());
    advance(180ms);
    EXPECT_THAT(answers, ElementsAre("OK"));
    EXPECT_EQ(button("OK"), nullptr);
}

TEST_F(AlertTest, AnActionThatMayNotDismissKeepsTheAlertOpen) {
    bool mayGo = false;
    const auto done = action("Done");
    done->setShouldDismissHandler([&] { return mayGo; });
    const auto prompt = givenPrompt(done);
    tap(*button("Done"));
    press(Key::enter);
    advance(1s);
    EXPECT_EQ(topPresented(), prompt);
    EXPECT_THAT(answers, IsEmpty());
    mayGo = true;
    press(Key::enter);
    advance(180ms);
    EXPECT_THAT(answers, ElementsAre("Done"));
}

TEST_F(AlertTest, EscapeTakesTheWayOut) {
    struct Case {
        std::vector<AlertAction::Pointer> actions;
        std::string taken;
    };
    const std::vector<Case> cases = {
        {{action("Delete", ActionStyle::destructive), action("Keep", ActionStyle::cancel)}, "Keep"},
        {{action("OK")}, "OK"},
        {{action("Cancel"), action("Create")}, "Cancel"},
    };
    for (const Case& each : cases) {
        present(alert(each.actions));
        press(Key::escape);
        advance(180ms);
        EXPECT_EQ(answers.back(), each.taken);
    }
    present(alert({action("Yes"), action("No")}));
    press(Key::escape);
    EXPECT_NE(topPresented(), nullptr) << "no way out is marked as such";
}

TEST_F(AlertTest, EnterTakesTheDefaultUnlessItIsDisabledOrAnotherButtonHasTheFocus) {
    const auto create = action("Create");
    create->setEnabled(false);
    givenPrompt(create);
    press(Key::enter);
    EXPECT_NE(topPresented(), nullptr);
    create->setEnabled(true);
    press(Key::tab);
    EXPECT_EQ(focusedTitle(), "Cancel");
    press(Key::enter);
    advance(180ms);
    EXPECT_THAT(answers, ElementsAre("Cancel"));
    const auto again = action("Create");
    givenPrompt(again);
    press(Key::enter);
    advance(180ms);
    EXPECT_EQ(answers.back(), "Create");
}

TEST_F(AlertTest, TabGoesRoundInsideAndTheFocusReturnsAfterwards) {
    auto outside = std::make_shared<Button>(ButtonType::system, Rect{20, 100, 120, 44});
    outside->setTitle("Outside");
    window().rootViewController()->view()->addSubview(outside);
    press(Key::tab);
    EXPECT_EQ(focusedTitle(), "Outside");
    present(alert({action("Cancel", ActionStyle::cancel), action("Rename"), action("Replace")}));
    EXPECT_EQ(focusedTitle(), "Replace") << "the default action";
    Journal stops;
    for (int i = 0; i < 4; ++i) {
        press(Key::tab);
        stops.push_back(focusedTitle());
    }
    EXPECT_THAT(stops, ElementsAre("Cancel", "Rename", "Replace", "Cancel"));
    press(Key::backtab);
    EXPECT_EQ(focusedTitle(), "Replace");
    press(Key::escape);
    EXPECT_EQ(focusedTitle(), "Outside");
}

TEST_F(AlertTest, WhereNothingHadTheFocusNothingHasItAfterwards) {
    auto outside = std::make_shared<Button>(ButtonType::system, Rect{20, 100, 120, 44});
    outside->setTitle("Outside");
    window().rootViewController()->view()->addSubview(outside);
    givenPrompt(action("Done"));
    press(Key::enter);
    advance(180ms);
    EXPECT_EQ(focusedTitle(), "");
}

TEST_F(AlertTest, WhereSomethingCouldBeDestroyedTheKeyboardRestsOnTheWayOut) {
    present(
        alert({action("Delete", ActionStyle::destructive), action("Cancel", ActionStyle::cancel)},
              AlertStyle::actionSheet));
    EXPECT_EQ(focusedTitle(), "Cancel");
}

TEST_F(AlertTest, AlertsStackAndTheUpperOneHearsTheKeys) {
    present(alert({action("Lower")}));
    present(alert({action("Upper")}));
    press(Key::escape);
    advance(180ms);
    press(Key::escape);
    advance(180ms);
    EXPECT_THAT(answers, ElementsAre("Upper", "Lower"));
}

TEST_F(AlertTest, AnAnswerMayAskTheNextQuestion) {
    const auto next = alert({action("Next")});
    const auto first = AlertAction::make("First", ActionStyle::standard, [&](AlertAction&) {
        window().rootViewController()->presentViewController(next, true);
    });
    present(alert({first}));
    press(Key::enter);
    advance(1s);
    EXPECT_EQ(topPresented(), next);
}

TEST_F(AlertTest, AScreenThatHasLeftStillTellsTheUserWhatWentWrong) {
    auto& stack = givenStack(std::make_shared<ViewController>());
    const auto page = std::make_shared<ViewController>();
    stack.pushViewController(page, false);
    stack.popViewController(false);
    const auto error = alert({action("OK")});
    page->presentViewController(error, true);
    EXPECT_EQ(topPresented(), error);
}

TEST_F(AlertTest, AContentAreaTakesRoomOnlyWhileItIsShown) {
    const auto prompt = givenPrompt(action("Done"));
    const double before = rectOf(*button("Done")).y;
    auto area = std::make_shared<ViewController>();
    auto line = std::make_shared<Label>();
    line->setText("Character not allowed in filename");
    line->setNumberOfLines(5);
    line->setFont(Font::preferred(TextStyle::footnote));
    line->setLaidOutByConstraints(true);
    area->view()->setLaidOutByConstraints(true);
    area->view()->addSubview(line);
    using enum LayoutAttribute;
    LayoutConstraint::activate(
        {LayoutConstraint::equal(*line, top, *area->view(), top),
         LayoutConstraint::equal(*line, height, *area->view(), height),
         LayoutConstraint::equal(*line, leading, *area->view(), leading, 16),
         LayoutConstraint::equal(*line, trailing, *area->view(), trailing, -16)});
    area->view()->setHidden(true);
    prompt->setContentViewController(area);
    settle();
    EXPECT_EQ(rectOf(*button("Done")).y, before);
    area->view()->setHidden(false);
    settle();
    EXPECT_GE(rectOf(*button("Done")).y, before + 8) << "half of the growth, about the middle";
    EXPECT_NEAR(rectOf(*line).width, 288 - 32, 0.5);
    EXPECT_EQ(line->frame().height, line->font().lineHeight());
}

TEST_F(AlertTest, ActionsStandInARowWhileTheirTitlesFitElseBelowEachOther) {
    present(alert({action("Replace"), action("Cancel", ActionStyle::cancel)}));
    EXPECT_EQ(rectOf(*button("Cancel")).y, rectOf(*button("Replace")).y);
    EXPECT_LT(rectOf(*button("Cancel")).x, rectOf(*button("Replace")).x) << "the way out is first";
    press(Key::escape);
    advance(180ms);
    present(alert({action("Open the Settings"), action("Cancel", ActionStyle::cancel)}));
    EXPECT_GT(rectOf(*button("Cancel")).y, rectOf(*button("Open the Settings")).y);
}

TEST_F(AlertTest, ASheetStandsAtTheBottomOfAPhoneWhateverItsAnchor) {
    auto anchor = std::make_shared<View>(Rect{0, 0, 390, 60});
    window().rootViewController()->view()->addSubview(anchor);
    const auto sheet =
        alert({action("Rename"), action("Cancel", ActionStyle::cancel)}, AlertStyle::actionSheet);
    sheet->setPopoverAnchor(anchor, {0, 30, 390, 0}, ArrowDirection::left | ArrowDirection::right);
    present(sheet);
    EXPECT_NEAR(rectOf(*button("Cancel")).maxY(), 844 - 8, 0.5);
    EXPECT_GE(rectOf(*button("Rename")).x, 0);
    EXPECT_LE(rectOf(*button("Rename")).maxX(), 390);
    tapAt({195, 100});
    advance(280ms);
    EXPECT_THAT(answers, ElementsAre("Cancel")) << "a tap beside a sheet is the way out";
}

TEST_F(AlertTest, EveryRowOfASheetTakesItsPress) {
    for (const std::string title : {"First", "Last", "Cancel"}) {
        present(alert({action("First"), action("Last"), action("Cancel", ActionStyle::cancel)},
                      AlertStyle::actionSheet));
        tap(*button(title));
        advance(280ms);
        EXPECT_EQ(answers.back(), title);
    }
}

TEST_F(AlertTest, APopoverPointsAtItsAnchorInsideTheTabletsWindow) {
    givenWindow(tabletSize, DeviceIdiom::tablet);
    auto anchor = std::make_shared<View>(Rect{960, 300, 44, 44});
    window().rootViewController()->view()->addSubview(anchor);
    const auto sheet =
        alert({action("Rename"), action("Cancel", ActionStyle::cancel)}, AlertStyle::actionSheet);
    sheet->setPopoverAnchor(anchor, {0, 22, 44, 0}, ArrowDirection::left | ArrowDirection::right);
    present(sheet);
    EXPECT_NEAR(rectOf(*button("Rename")).maxX(), 960 - 11, 1);
    window().resize({500, 700});
    settle();
    EXPECT_NEAR(rectOf(*button("Cancel")).maxY(), 700 - 8, 0.5) << "a narrow window has no room";
}

TEST_F(AlertTest, AnAlertHigherThanTheWindowScrollsToTheFocus) {
    givenWindow({480, 320});
    application().setTextScale(2);
    present(alert({action("First choice"), action("Second choice"), action("Third choice"),
                   action("Cancel", ActionStyle::cancel)}));
    press(Key::tab);
    while (focusedTitle() != "Cancel")
        press(Key::tab);
    EXPECT_LE(rectOf(*button("Cancel")).maxY(), 320);
    press(Key::tab);
    EXPECT_EQ(focusedTitle(), "First choice");
    EXPECT_GE(rectOf(*button("First choice")).y, 0);
}

TEST_F(AlertTest, WhatItsActionsHoldIsLetGoAfterTheAnswer) {
    auto prompt = std::make_shared<int>(1);
    const std::weak_ptr<int> watched = prompt;
    present(alert({AlertAction::make("OK", ActionStyle::standard, [prompt](AlertAction&) {})}));
    prompt.reset();
    const auto shown = topPresented();
    press(Key::enter);
    advance(180ms);
    EXPECT_TRUE(watched.expired()) << "although the alert itself is still held";
}

} // namespace
} // namespace test
