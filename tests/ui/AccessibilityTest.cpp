#include "platform/ui/qt/Bridge.h"
#include "tests/ui/UiFixture.h"

#include <QAccessible>
#include <QWidget>

namespace test {
namespace {

using namespace platform;

/// What a screen reader is told of a view.
class AccessibilityTest : public UiTest {
protected:
    static QAccessibleInterface& heard(const View& view) {
        return *QAccessible::queryAccessibleInterface(widgetOf(view));
    }
    static std::string name(const View& view) {
        return fromQt(heard(view).text(QAccessible::Name));
    }
    /// The nearest thing of that role around the view.
    static QAccessibleInterface* around(const View& view, QAccessible::Role role) {
        QAccessibleInterface* each = &heard(view);
        while (each && each->role() != role)
            each = each->parent();
        return each;
    }
    template<class T>
    std::shared_ptr<T> shown(std::shared_ptr<T> view) {
        window().rootViewController()->view()->addSubview(view);
        settle();
        return view;
    }
};

TEST_F(AccessibilityTest, ControlsSayWhatTheyAreAndWhatTheyAreCalled) {
    const auto label = shown(std::make_shared<Label>());
    label->setText("Report.pdf");
    EXPECT_EQ(heard(*label).role(), QAccessible::StaticText);
    EXPECT_EQ(name(*label), "Report.pdf");
    const auto button = shown(std::make_shared<Button>(ButtonType::system));
    button->setTitle("Q&A");
    EXPECT_EQ(heard(*button).role(), QAccessible::PushButton);
    EXPECT_EQ(name(*button), "Q&A");
    button->setAccessibleName("Questions");
    EXPECT_EQ(name(*button), "Questions");
    const auto field = shown(std::make_shared<TextField>());
    field->setPlaceholder("Folder Name");
    field->setText("Travel");
    EXPECT_EQ(heard(*field).role(), QAccessible::EditableText);
    EXPECT_EQ(name(*field), "Folder Name");
    EXPECT_EQ(heard(*field).text(QAccessible::Value), toQt("Travel"));
    field->setSecure(true);
    EXPECT_TRUE(heard(*field).state().passwordEdit);
}

TEST_F(AccessibilityTest, AViewThatCanBeTappedIsAButtonThatCanBePressed) {
    const auto label = shown(std::make_shared<Label>());
    label->setText("Report.pdf");
    label->addTapHandler([this] { journal.push_back("tapped"); });
    EXPECT_EQ(heard(*label).role(), QAccessible::Button);
    QAccessibleActionInterface* const actions = heard(*label).actionInterface();
    ASSERT_TRUE(actions->actionNames().contains(QAccessibleActionInterface::pressAction()));
    actions->doAction(QAccessibleActionInterface::pressAction());
    EXPECT_EQ(journal, Journal{"tapped"});
}

TEST_F(AccessibilityTest, TextThatIsSetThroughItIsTheUsersOwn) {
    const auto field = shown(std::make_shared<TextField>());
    field->setEditingChangedHandler(
        [this](TextField& changed) { journal.push_back(changed.text()); });
    field->setText("by the program");
    heard(*field).setText(QAccessible::Value, toQt("by the user"));
    EXPECT_EQ(journal, Journal{"by the user"});
}

TEST_F(AccessibilityTest, WhatLiesBelowADialogTakesNoAction) {
    const auto label = shown(std::make_shared<Label>());
    label->addTapHandler([this] { journal.push_back("tapped"); });
    const auto below = shown(std::make_shared<Button>(ButtonType::system));
    below->addAction(ControlEvent::touchUpInside, [this] { journal.push_back("pressed"); });
    const auto press = [](const View& view) {
        heard(view).actionInterface()->doAction(QAccessibleActionInterface::pressAction());
    };
    const auto alert = AlertController::create("Rename Item", "", AlertStyle::alert);
    alert->addAction(AlertAction::make("OK", ActionStyle::standard));
    window().rootViewController()->presentViewController(alert, false);
    for (const View* each : {static_cast<View*>(label.get()), static_cast<View*>(below.get())}) {
        EXPECT_TRUE(heard(*each).state().disabled);
        press(*each);
    }
    EXPECT_EQ(journal, Journal{});
    EXPECT_FALSE(heard(*button("OK")).state().disabled);
    alert->dismissViewController(false);
    settle();
    press(*below);
    EXPECT_EQ(journal, Journal{"pressed"});
}

TEST_F(AccessibilityTest, AnAlertIsADialogCalledByItsTitle) {
    const auto alert = AlertController::create("Rename Item", "", AlertStyle::alert);
    alert->addAction(AlertAction::make("OK", ActionStyle::standard));
    window().rootViewController()->presentViewController(alert, false);
    QAccessibleInterface* const dialog = around(*button("OK"), QAccessible::Dialog);
    ASSERT_NE(dialog, nullptr);
    EXPECT_EQ(dialog->text(QAccessible::Name), toQt("Rename Item"));
    EXPECT_TRUE(dialog->state().modal);
}

TEST_F(AccessibilityTest, BarButtonsWithPicturesHaveNamesAndTheBackButtonSaysWhere) {
    auto& stack = givenStack(std::make_shared<ViewController>());
    stack.topViewController()->setTitle("Documents");
    const auto page = std::make_shared<ViewController>();
    page->setTitle("Report");
    const auto trash = BarButtonItem::withSystemItem(SystemItem::trash);
    page->navigationItem().setRightBarButtonItem(trash);
    stack.pushViewController(page, false);
    settle();
    EXPECT_EQ(name(*trash->shownView()), "Delete");
    EXPECT_EQ(name(*button("Documents")), "Back, Documents");
    EXPECT_EQ(heard(*label("Report")).role(), QAccessible::Heading);
}

} // namespace
} // namespace test
