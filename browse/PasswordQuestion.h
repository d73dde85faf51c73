#pragma once

#include "platform/cloud/AccountFile.h"
#include "platform/ui/AlertController.h"

#include <memory>
#include <string>

namespace tavrin {

/// Asks for the password of an account, over the screen, and says why. Work goes on with the answer; without one it waits. Answers the alert. Main thread.
std::shared_ptr<platform::AlertController>
askForPassword(const std::shared_ptr<platform::ViewController>& screen,
               const platform::AccountRecord& account, const std::string& why);

} // namespace tavrin
