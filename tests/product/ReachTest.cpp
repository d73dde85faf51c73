// What people reach who use keys or a screen reader: every screen of the program, as a whole.

#include "platform/ui/qt/Bridge.h"
#include "tests/product/ProductFixture.h"

#include <QAccessible>
#include <QApplication>
#include <QTest>
#include <QWidget>

using platform::DocumentAction;
using testing::ElementsAre;
using testing::IsEmpty;

namespace test {
namespace {

struct Reach : ProductTest {
    void givenFolder() {
        signIn();
        givenFile("Notes/Milk.txt", "two litres");
        givenFile("Report.txt", "all is well");
        launch();
        open("Documents");
        untilShows("Report.txt");
        calmDown();
    }
    QWidget& top() { return *platform::widgetOf(*nav().view())->window(); }
    void press(Qt::Key key, Qt::KeyboardModifiers modifiers = Qt::NoModifier) {
        QWidget* const focused = QApplication::focusWidget();
        QTest::keyClick(focused ? focused : &top(), key, modifiers);
        advance(1s);
    }
    /// What a screen reader calls the control that has the focus.
    static std::string focused() {
        QAccessibleInterface* const heard =
            QAccessible::queryAccessibleInterface(QApplication::focusWidget());
        return heard ? platform::fromQt(heard->text(QAccessible::Name)) : "";
    }
    static constexpr int mostStops = 12;
    void tabTo(const std::string& name) {
        for (int i = 0; i < mostStops && focused() != name; ++i)
            press(Qt::Key_Tab);
        ASSERT_EQ(focused(), name);
    }
    /// Once around, beginning where the focus is.
    std::vector<std::string> stops() {
        std::vector<std::string> names{focused()};
        for (int i = 0; i < mostStops; ++i) {
            press(Qt::Key_Tab);
            if (focused() == names.front())
                break;
            names.push_back(focused());
        }
        return names;
    }
    /// Roles and places of what can be used but has no name.
    static void findNameless(QAccessibleInterface& each, std::vector<std::string>& found) {
        const QAccessible::State state = each.state();
        if (state.invisible)
            return;
        const QAccessible::Role role = each.role();
        const bool used =
            state.focusable || role == QAccessible::Button || role == QAccessible::ListItem;
        if (used && role != QAccessible::Window && each.text(QAccessible::Name).isEmpty())
            found.push_back(std::to_string(role) + " at " + std::to_string(each.rect().x()) + "," +
                            std::to_string(each.rect().y()));
        for (int i = 0; i < each.childCount(); ++i)
            if (QAccessibleInterface* const child = each.child(i))
                findNameless(*child, found);
    }
    std::vector<std::string> nameless() {
        std::vector<std::string> found;
        findNameless(*QAccessible::queryAccessibleInterface(&top()), found);
        return found;
    }
    void perform(DocumentAction action, const std::string& name) {
        nav().documentListControllerPerformAction(*list(), static_cast<int>(action), row(name),
                                                  list()->view(), [] {});
        advance(1s);
    }
    void closePresented() {
        topPresented()->dismissViewController(false);
        advance(1s);
    }
};

TEST_F(Reach, everythingThatCanBeUsedHasANameOnEveryScreen) {
    launch();
    EXPECT_THAT(nameless(), IsEmpty()) << "nobody signed in";
    delegate.reset();
    platform.reset();
    givenFolder();
    EXPECT_THAT(nameless(), IsEmpty()) << "folder";
    nav().beginEditMode();
    advance(1s);
    EXPECT_THAT(nameless(), IsEmpty()) << "edit mode";
    nav().endEditMode();
    for (const auto action :
         {DocumentAction::remove, DocumentAction::more, DocumentAction::rename}) {
        perform(action, "Report.txt");
        EXPECT_THAT(nameless(), IsEmpty()) << "action " << static_cast<int>(action);
        closePresented();
    }
    perform(DocumentAction::information, "Report.txt");
    EXPECT_THAT(nameless(), IsEmpty()) << "details";
    nav().popViewController(false);
    advance(1s);
    press(Qt::Key_F, Qt::ControlModifier);
    EXPECT_THAT(nameless(), IsEmpty()) << "search";
    closePresented();
    nav().showAccount();
    advance(1s);
    EXPECT_THAT(nameless(), IsEmpty()) << "account";
    nav().showSignIn(tavrin::SignInViewController::Kind::server);
    advance(1s);
    EXPECT_THAT(nameless(), IsEmpty()) << "sign-in";
    EXPECT_THAT(stops(), ElementsAre("Address", "User", "Password", "Sign In", "Cancel", "Back, Account"));
    nav().popViewController(false);
    nav().popViewController(false);
    advance(1s);
    nav().showMoveTargetForItems({row("Report.txt")}, list()->presentedURL());
    advance(1s);
    EXPECT_THAT(nameless(), IsEmpty()) << "move";
    closePresented();
    open("Report.txt");
    calmDown();
    EXPECT_THAT(nameless(), IsEmpty()) << "document";
}

TEST_F(Reach, tabGoesThroughAScreenFromTheTopToTheBottom) {
    givenFolder();
    tabTo("Back, Tavrin");
    EXPECT_THAT(stops(), ElementsAre("Back, Tavrin", "Select", "Search", "Documents"));
    nav().beginEditMode();
    advance(1s);
    tabTo("Cancel");
    EXPECT_THAT(stops(), ElementsAre("Cancel", "Documents", "New Folder"));
}

TEST_F(Reach, controlASelectsAllWhateverHasTheFocus) {
    givenFolder();
    tabTo("Select");
    press(Qt::Key_Return);
    ASSERT_EQ(focused(), "Cancel");
    press(Qt::Key_A, Qt::ControlModifier);
    EXPECT_EQ(list()->selectedItemCount(), 2U);
    EXPECT_EQ(list()->navigationItem().title(), "2 Items Selected");
    press(Qt::Key_Escape);
    EXPECT_FALSE(nav().editMode());
    press(Qt::Key_A, Qt::ControlModifier);
    EXPECT_EQ(list()->selectedItemCount(), 0U) << "there is nothing to select with";
}

} // namespace
} // namespace test
