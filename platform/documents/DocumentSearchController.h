#pragma once

#include "platform/base/Url.h"
#include "platform/ui/ViewController.h"

#include <memory>

namespace platform {

class DocumentListController;

/// The search screen over the whole store. A list presents it over the navigation stack; what is
/// tapped in the results is reported through that list's delegate while the screen is presented.
class DocumentSearchController : public ViewController {
public:
    static std::shared_ptr<DocumentSearchController>
    create(const std::shared_ptr<DocumentListController>& list);
    ~DocumentSearchController() override;

    void loadView() override;
    void viewDidAppear(bool animated) override;
    bool performKeyCommand(KeyCommand command) override;

    struct Impl;

private:
    explicit DocumentSearchController(std::unique_ptr<Impl> impl);
    std::unique_ptr<Impl> impl_;
};

} // namespace platform
