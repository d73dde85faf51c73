#pragma once

#include "tests/documents/ScreenHouse.h"
#include "tests/ui/Person.h"

#include <gtest/gtest.h>

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace test {

/// A desk with applications of its own, a signed-in store and a person before the window.
class Desk : public testing::Test, public Person {
protected:
    Desk();
    ~Desk() override;

    /// An entry in the user's folder, or in "system", the only other one. `lines` follow its name.
    void givenApplication(const std::string& id, const std::string& name, const std::string& lines,
                          const std::string& place = "data");
    /// A list below the home folder ("config/mimeapps.list").
    void givenList(const std::string& path, const std::string& text) {
        house.home.write(path, text);
    }
    /// A program that writes its arguments, a line each, to the file of its name with ".said"; then
    /// it ends with that status. Answers its path.
    std::string givenProgram(const std::string& name, int status = 0);
    /// What the program was given, once it has run.
    std::optional<std::vector<std::string>> argumentsOf(const std::string& name);
    void set(const char* variable, const std::optional<std::string>& value);

    platform::Window& window() override { return *house.window; }
    void settle() override { house.settle(); }
    /// Signs in, opens the window, and stands a screen in it.
    void open(platform::Size size = {360, 640});

    ScreenHouse house;

private:
    std::vector<std::pair<std::string, std::optional<std::string>>> former_;
};

} // namespace test
