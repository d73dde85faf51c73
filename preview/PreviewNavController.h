#pragma once

#include "platform/ui/NavigationController.h"

namespace tavrin {

/// A navigation stack for previews; adds nothing of its own.
class PreviewNavController : public platform::NavigationController {
public:
    void viewDidLoad() override { NavigationController::viewDidLoad(); }
    void didReceiveMemoryWarning() override { NavigationController::didReceiveMemoryWarning(); }
};

} // namespace tavrin
