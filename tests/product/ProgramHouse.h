#pragma once

#include "app/AppDelegate.h"
#include "browse/NavController.h"
#include "platform/ui/AlertController.h"
#include "platform/ui/Application.h"
#include "tests/product/LogCapture.h"
#include "tests/product/ProductHouse.h"
#include "tests/ui/Person.h"

#include <memory>
#include <string>
#include <vector>

namespace test {

using namespace std::chrono_literals;

inline constexpr platform::Size phone{390, 844};
inline constexpr platform::Size tablet{1024, 768};

/// The whole program before a person: the real delegate, window and store; time stands still.
class ProgramHouse : public Person, public ProductHouse {
public:
    ProgramHouse();
    ~ProgramHouse() override;

    /// Launches the program on the store (or, before signIn, with nobody signed in).
    void launch(platform::Size size = tablet);
    /// The same again on what the last one left.
    void relaunch();

    platform::Window& window() override { return *delegate->mainWindow(); }
    void settle() override { application->processPending(); }
    /// Moves time on, frame by frame, with all that happens meanwhile.
    void advance(platform::Duration time);

    tavrin::NavController& nav() const;
    std::shared_ptr<platform::DocumentListController> list() const {
        return nav().getTopDocumentListController();
    }
    /// Names in the top list, as it shows them.
    std::vector<std::string> shown() const;
    /// Waits until the top list shows an entry of that name.
    bool untilShows(const std::string& name);
    /// Waits for what other threads do, in the time of the real world, until nothing happens any
    /// more.
    void calmDown();
    /// Titles of the screens of the stack, the bottom first.
    std::vector<std::string> titles() const;
    /// Opens a folder, container or file of the top list as a tap on its row does.
    void open(const std::string& name);
    /// The row's URL.
    platform::Url row(const std::string& name) const;
    platform::AlertController* alert();
    /// "title: message" of the alert in sight; "" for none.
    std::string alertText();
    /// A picture of the window, for the eye.
    void savePicture(const std::string& file, double scale = 1);

    std::shared_ptr<tavrin::AppDelegate> delegate;
    std::unique_ptr<platform::Application> application;
};

} // namespace test
