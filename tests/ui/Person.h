#pragma once

#include "platform/ui/Controls.h"
#include "platform/ui/Window.h"

#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace test {

enum class Key { escape, enter, tab, backtab, space, backspace, altLeft, left, right };

/// What a person at the screen does and sees, by the real window's own events. A fixture says which
/// window it is and how things come to rest.
class Person {
public:
    virtual ~Person() = default;

    virtual platform::Window& window() = 0;
    virtual void settle() = 0;

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
};

} // namespace test
