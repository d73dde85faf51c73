#pragma once

#include "platform/ui/AlertController.h"
#include "platform/ui/Controls.h"
#include "platform/ui/NavigationController.h"
#include "platform/ui/Window.h"
#include "tests/ui/UiEnvironment.h"

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace test {

using namespace std::chrono_literals;

inline constexpr platform::Size phoneSize{390, 844};
inline constexpr platform::Size tabletSize{1024, 768};

enum class Key { escape, enter, tab, backtab, space, backspace, altLeft, left, right };

/// The words of a person at the screen, over a real window whose time stands still. The environment
/// is one for the whole program; each test gets a phone in portrait, reading to the right.
class UiTest : public testing::Test {
protected:
    UiTest();
    ~UiTest() override;

    static UiEnvironment& environment();
    /// Ends the application with its runtime and begins another; the window goes.
    void restartApplication();
    static platform::Application& application() { return *environment().application; }

    /// A visible window; the one before goes.
    platform::Window& givenWindow(platform::Size size = phoneSize,
                                  platform::DeviceIdiom idiom = platform::DeviceIdiom::phone);
    platform::Window& window();
    /// A stack with that screen at its bottom as the window's root.
    platform::NavigationController&
    givenStack(const std::shared_ptr<platform::ViewController>& bottom);

    static void advance(platform::Duration time) { environment().advance(time); }
    static void settle() { environment().settle(); }

    /// Presses where the view's middle shows, so that what lies over it gets the press.
    void tap(const platform::View& view);
    void tapAt(platform::Point point);
    void pressDown(platform::Point point);
    void letGo(platform::Point point);
    void press(Key key);
    /// Letter by letter, as keys do.
    void type(std::string_view text);
    /// As an input method hands over a finished word.
    void commit(std::string_view text);
    void fingerDown(platform::Point point);
    void fingerTo(platform::Point point);
    void fingerUp(platform::Point point);

    /// The button, bar or alert, that shows the title; none when there is none in sight.
    platform::Button* button(std::string_view title);
    std::vector<std::string> buttonTitles();
    platform::Label* label(std::string_view text);
    /// The title of the button with the keyboard's focus; "" for none.
    std::string focusedTitle();
    std::shared_ptr<platform::ViewController> topPresented();

    /// What the test's screens and handlers wrote down; outlives the window.
    std::vector<std::string> journal;

private:
    std::unique_ptr<platform::Window> window_;
    std::shared_ptr<platform::NavigationController> stack_;
};

/// What screens were told, in order: "list willAppear".
using Journal = std::vector<std::string>;

/// A screen that writes down what it is told.
class TestScreen : public platform::ViewController {
public:
    TestScreen(std::string name, Journal& journal);
    ~TestScreen() override;

    void viewDidLoad() override;
    void viewWillAppear(bool animated) override;
    void viewDidAppear(bool animated) override;
    void viewWillDisappear(bool animated) override;
    void viewDidDisappear(bool animated) override;

    const std::string name;
    std::function<void()> onWillAppear;

private:
    void note(std::string_view what);
    Journal& journal_;
};

} // namespace test
