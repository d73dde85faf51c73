#pragma once

#include "platform/ui/ViewController.h"

#include <memory>
#include <string_view>

namespace platform {

/// The screen that stands in place of the lists while no account can be used: says so, says why
/// when there is a cause (CloudAccountService::problem), and what to do.
class DocumentPickerUnavailableViewController : public ViewController {
public:
    DocumentPickerUnavailableViewController();
    ~DocumentPickerUnavailableViewController() override;
    void loadView() override;
    void viewWillAppear(bool animated) override;

private:
    struct Content;
    std::shared_ptr<Content> content_;
};

/// Makes a platform screen by the name of its class; none when the platform has no such screen.
std::shared_ptr<ViewController> makeScreenByClassName(std::string_view className);

} // namespace platform
