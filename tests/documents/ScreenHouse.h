#pragma once

#include "platform/documents/DocumentListController.h"
#include "platform/ui/Application.h"
#include "platform/ui/NavigationController.h"
#include "platform/ui/Window.h"
#include "tests/documents/StoreHouse.h"

#include <memory>
#include <string>
#include <string_view>
#include <vector>

class QWidget;

namespace test {

/// A store with the toolkit running on it, and a window with a navigation stack.
class ScreenHouse : public StoreHouse {
public:
    ScreenHouse();
    ~ScreenHouse();

    /// After signIn() or withoutAccount().
    void openWindow(platform::Size size = {360, 640});
    /// Shows the list of the folder on a new stack and waits until it has read it.
    std::shared_ptr<platform::DocumentListController> showList(std::string_view folder = "");
    void show(std::vector<std::shared_ptr<platform::ViewController>> screens);
    /// Moves time on, frame by frame, with all that happens meanwhile.
    void advance(platform::Duration time);
    void settle();
    /// Lets other threads work for a moment; for pictures, which wait for nothing in particular.
    void waitBriefly();
    void savePicture(const std::string& file, double scale = 2) const;

    std::unique_ptr<platform::Application> application;
    std::unique_ptr<platform::Window> window;
    std::shared_ptr<platform::NavigationController> navigation;
};

} // namespace test
