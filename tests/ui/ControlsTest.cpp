#include "platform/ui/Canvas.h"
#include "platform/ui/StackView.h"
#include "platform/ui/Theme.h"
#include "tests/ui/UiFixture.h"

#include <gmock/gmock.h>

namespace test {
namespace {

using namespace platform;
using testing::ElementsAre;

class ControlsTest : public UiTest {
protected:
    template<class T>
    std::shared_ptr<T> shown(std::shared_ptr<T> view) {
        window().rootViewController()->view()->addSubview(view);
        settle();
        return view;
    }
    std::shared_ptr<TextField> givenField() {
        auto field = shown(std::make_shared<TextField>(Rect{20, 40, 300, 44}));
        field->setEditingChangedHandler(
            [this](TextField& edited) { journal.push_back(edited.text()); });
        field->becomeFirstResponder();
        settle();
        return field;
    }
    std::shared_ptr<Button> givenButton(std::string_view title) {
        auto made = std::make_shared<Button>(ButtonType::system, Rect{20, 40, 0, 0});
        made->setTitle(title);
        made->sizeToFit();
        made->addAction(ControlEvent::touchUpInside,
                        [this, name = std::string(title)] { journal.push_back(name); });
        return shown(made);
    }
};

TEST_F(ControlsTest, ALabelOfOneLineIsAsHighAsTheThemesLineAndElidesWhatDoesNotFit) {
    auto label = shown(std::make_shared<Label>());
    label->setText("Quarterly report.numbers");
    EXPECT_EQ(label->intrinsicContentSize().height, 22);
    label->sizeToFit();
    EXPECT_FALSE(label->isTruncated());
    label->setFrame({0, 0, label->frame().width - 2, 22});
    EXPECT_TRUE(label->isTruncated());
    label->setText("");
    EXPECT_EQ(label->intrinsicContentSize(), (Size{0, 0}));
}

TEST_F(ControlsTest, AWrappedLabelsHeightFollowsItsSolvedWidthAndItsText) {
    auto label = std::make_shared<Label>();
    label->setText("A text of several lines that wraps at the width that the layout gives to it");
    label->setNumberOfLines(0);
    auto below = std::make_shared<View>();
    auto column =
        shown(std::make_shared<StackView>(std::vector<std::shared_ptr<View>>{label, below}));
    column->setAxis(Axis::vertical);
    column->setLaidOutByConstraints(true);
    View& page = *column->superview();
    const auto width =
        LayoutConstraint::constant(*column, LayoutAttribute::width, LayoutRelation::equal, 300);
    LayoutConstraint::activate(
        {width,
         LayoutConstraint::equal(*column, LayoutAttribute::leading, page, LayoutAttribute::leading),
         LayoutConstraint::equal(*column, LayoutAttribute::top, page, LayoutAttribute::top)});
    settle();
    const double wide = label->frame().height;
    EXPECT_GE(wide, 2 * 22);
    width->setConstant(150);
    settle();
    EXPECT_GE(label->frame().height, 2 * wide);
    EXPECT_EQ(below->frame().y, label->frame().maxY());
    label->setNumberOfLines(2);
    settle();
    EXPECT_EQ(label->frame().height, 2 * 22);
    EXPECT_TRUE(label->isTruncated());
}

TEST_F(ControlsTest, TheTextScaleAppliesToWhatIsShownAlready) {
    const auto button = givenButton("Download");
    auto label = shown(std::make_shared<Label>());
    label->setText("Report");
    const double width = label->intrinsicContentSize().width;
    const Font font = label->font();
    application().setTextScale(2);
    EXPECT_EQ(font.pointSize(), 34);
    EXPECT_EQ(label->intrinsicContentSize().height, 44);
    EXPECT_NEAR(label->intrinsicContentSize().width, 2 * width, 2);
}

TEST_F(ControlsTest, AStyledLineMeasuresItsTextsAndPictures) {
    auto label = shown(std::make_shared<Label>());
    const Font font = label->font();
    ImageCanvas canvas({10, font.lineHeight()}, false, 1);
    label->setStyledText({{{"", canvas.image(), 0}, {"Blue ", {}, -font.descender()}}});
    EXPECT_EQ(label->intrinsicContentSize().height, font.lineHeight());
    EXPECT_NEAR(label->intrinsicContentSize().width, 10 + font.width("Blue "), 1);
    label->setText("plain");
    EXPECT_EQ(label->text(), "plain");
}

TEST_F(ControlsTest, AButtonAnswersTapsSpaceAndEnterOnlyWhileEnabled) {
    const auto button = givenButton("Move");
    EXPECT_GE(button->frame().width, 44);
    EXPECT_GE(button->frame().height, 44);
    tap(*button);
    press(Key::tab);
    press(Key::space);
    press(Key::enter);
    button->setEnabled(false);
    tap(*button);
    button->sendActions(ControlEvent::touchUpInside);
    EXPECT_THAT(journal, ElementsAre("Move", "Move", "Move"));
}

TEST_F(ControlsTest, APressThatIsDrawnAwayIsNoTap) {
    const auto button = givenButton("Move");
    pressDown(button->frame().center());
    letGo({300, 700});
    EXPECT_TRUE(journal.empty());
}

TEST_F(ControlsTest, ATapHandlerMakesAnyViewAButton) {
    auto label = shown(std::make_shared<Label>(Rect{20, 100, 200, 30}));
    label->setText("Report.pdf");
    label->addTapHandler([this] { journal.push_back("tapped"); });
    tap(*label);
    press(Key::tab);
    press(Key::enter);
    EXPECT_THAT(journal, ElementsAre("tapped", "tapped"));
    label->setUserInteractionEnabled(false);
    tap(*label);
    EXPECT_EQ(journal.size(), 2U);
}

TEST_F(ControlsTest, AFieldReportsTheUsersEditsAndNotTheProgramsOwn) {
    const auto field = givenField();
    field->setText("x");
    EXPECT_TRUE(journal.empty());
    type("ab");
    commit("é");
    press(Key::backspace);
    EXPECT_THAT(journal, ElementsAre("xa", "xab", "xabé", "xab"));
}

TEST_F(ControlsTest, WordsAreCapitalisedAsTheyAreTypedButNotAgainstTheUser) {
    const auto field = givenField();
    field->setCapitalization(Capitalization::words);
    type("new folder");
    EXPECT_EQ(field->text(), "New Folder");
    field->setText("");
    type("k");
    press(Key::backspace);
    type("kWatt");
    EXPECT_EQ(field->text(), "kWatt") << "a capital that was taken back stays so";
    field->setText("");
    commit("naïve");
    EXPECT_EQ(field->text(), "naïve") << "what an input method hands over is final";
    field->setText("");
    field->setCapitalization(Capitalization::sentences);
    type("one two. three");
    EXPECT_EQ(field->text(), "One two. Three");
}

TEST_F(ControlsTest, TheReturnKeyMayNeedText) {
    const auto field = givenField();
    field->setReturnKeyNeedsText(true);
    field->setReturnHandler([this](TextField&) { journal.push_back("return"); });
    press(Key::enter);
    EXPECT_TRUE(journal.empty());
    type("a");
    press(Key::enter);
    EXPECT_THAT(journal, ElementsAre("a", "return"));
}

TEST_F(ControlsTest, TheClearButtonShowsWhileEditingAndEmptiesAsTheUserWould) {
    const auto field = givenField();
    field->setClearButtonWhileEditing(true);
    tapAt({320 - 18, 62});
    EXPECT_TRUE(journal.empty()) << "there is nothing to clear";
    type("abc");
    tapAt({320 - 18, 62});
    EXPECT_EQ(field->text(), "");
    EXPECT_EQ(journal.back(), "");
    EXPECT_TRUE(field->isFirstResponder());
}

TEST_F(ControlsTest, ASelectionIsGivenInUnitsOfTheInputMethodAndKeptInside) {
    const auto field = givenField();
    field->setText("Report.pdf");
    field->setSelectedRange(6, 0);
    EXPECT_EQ(field->selectedRange(), (std::pair<std::size_t, std::size_t>{6, 0}));
    type("s");
    EXPECT_EQ(field->text(), "Reports.pdf");
    field->setSelectedRange(7, 100);
    EXPECT_EQ(field->selectedRange(), (std::pair<std::size_t, std::size_t>{7, 4}));
}

TEST_F(ControlsTest, AFieldMadeFirstBeforeItIsShownGetsTheFocusWhenItIs) {
    auto field = std::make_shared<TextField>(Rect{20, 40, 300, 44});
    field->becomeFirstResponder();
    shown(field);
    EXPECT_TRUE(field->isFirstResponder());
}

} // namespace
} // namespace test
