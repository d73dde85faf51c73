#pragma once

#include "tests/acceptance/Accessible.h"
#include "tests/acceptance/Desk.h"

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace test {

/// Somebody before the program who cannot see it: knows of it what the accessibility tree tells,
/// and does what that offers. A dialog in sight is all that there is to act on. What does not
/// come about in good time ends the story with an exception that says what was missing.
class Visitor {
public:
    explicit Visitor(const Desk& desk) : desk_(desk) {}

    /// Starts the program; answers when its window is there.
    void launch();
    /// The power goes: nothing is asked, nothing is saved.
    void killProgram();

    /// Waits until that is in sight.
    Accessible sees(const std::string& role, const std::string& name) const;
    Accessible row(const std::string& name) const { return sees("list item", name); }
    /// The name of the screen on top.
    void seesTitle(const std::string& title) const { sees("heading", title); }
    /// A text that has this in it; answers the whole.
    std::string reads(const std::string& part) const;
    void seesNo(const std::string& role, const std::string& name) const;
    /// Names of the rows in sight, from the top.
    std::vector<std::string> rows() const;

    /// Waits until it is there and can be pressed.
    void press(const std::string& role, const std::string& name) const;
    void pressButton(const std::string& name) const { press("push button", name); }
    void open(const std::string& name) const { press("list item", name); }
    void goBack() const;
    /// One of the actions that a row offers.
    void choose(const std::string& action, const std::string& rowName) const;
    void select(const std::vector<std::string>& names) const;
    /// Into the only field in sight.
    void type(const std::string& text) const;

    /// Looks until it is so; `what` is what was waited for.
    void until(const std::string& what, const std::function<bool()>& isSo) const;
    /// The whole tree as text.
    std::string tree() const;

private:
    std::optional<Accessible> application() const;
    /// The window, or the dialog before it.
    std::optional<Accessible> scope() const;
    std::optional<Accessible> look(const std::string& role, const std::string& name) const;

    const Desk& desk_;
    std::unique_ptr<Program> program_;
};

} // namespace test
