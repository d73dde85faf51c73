#pragma once

#include "platform/ui/ViewController.h"

#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace platform {

/// The screen that stands in place of the lists while no account can be used: says so, says why
/// when there is a cause (CloudAccountService::problem), and what to do.
class DocumentPickerUnavailableViewController : public ViewController {
public:
    DocumentPickerUnavailableViewController();
    ~DocumentPickerUnavailableViewController() override;
    void loadView() override;
    void viewWillAppear(bool animated) override;

    /// A way to an account that the program offers here.
    struct Choice {
        std::string title;
        std::function<void()> choose;
    };
    /// Buttons in place of the advice for the command line. Once, before the screen is shown.
    void setChoices(std::vector<Choice> choices);

private:
    struct Content;
    std::vector<Choice> choices_;
    std::shared_ptr<Content> content_;
};

/// Makes a platform screen by the name of its class; none when the platform has no such screen.
std::shared_ptr<ViewController> makeScreenByClassName(std::string_view className);

} // namespace platform
