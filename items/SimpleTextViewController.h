#pragma once

#include "platform/ui/Controls.h"
#include "platform/ui/ViewController.h"

namespace tavrin {

/// A few lines of red text: the error line of a filename prompt.
class SimpleTextViewController : public platform::ViewController {
public:
    /// Made with the controller, so that its text can be set before the view is loaded.
    const std::shared_ptr<platform::Label>& messageLabel() const { return messageLabel_; }
    static platform::Font messageLabelFont();

    void viewDidLoad() override;

private:
    static double _labelHorizontalInsets();

    std::shared_ptr<platform::Label> messageLabel_ = std::make_shared<platform::Label>();
};

} // namespace tavrin
