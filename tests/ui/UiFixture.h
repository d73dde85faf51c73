#pragma once

#include "platform/ui/AlertController.h"
#include "platform/ui/Controls.h"
#include "platform/ui/NavigationController.h"
#include "platform/ui/Window.h"
#include "tests/ui/Person.h"
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

/// A person before a real window whose time stands still. The environment is one for the whole
/// program; each test gets a phone in portrait, reading to the right.
class UiTest : public testing::Test, public Person {
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
    platform::Window& window() override;
    /// A stack with that screen at its bottom as the window's root.
    platform::NavigationController&
    givenStack(const std::shared_ptr<platform::ViewController>& bottom);

    static void advance(platform::Duration time) { environment().advance(time); }
    void settle() override { environment().settle(); }

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
