#include "app/PasswordPrompt.h"

#include "app/FreeScreen.h"
#include "browse/PasswordQuestion.h"
#include "platform/Platform.h"
#include "platform/cloud/AccountManager.h"
#include "platform/cloud/CloudService.h"
#include "platform/ui/Application.h"

namespace tavrin {

using platform::Platform;

PasswordPrompt::PasswordPrompt(platform::Window& window) : window_(window) {
    platform::NotificationCenter& center = Platform::current().notifications();
    problemChanged_ = center.observe(platform::cloudProblemDidChangeNotification,
                                     [this](const platform::Notification&) { update(); });
    becameActive_ = center.observe(platform::applicationDidBecomeActiveNotification,
                                   [this](const platform::Notification&) {
                                       asked_ = false;
                                       update();
                                   });
    update();
}

PasswordPrompt::~PasswordPrompt() = default;

void PasswordPrompt::update() {
    const std::optional<std::string> why = Platform::current().cloud().passwordWanted();
    if (!why) {
        asked_ = false;
        retry_.cancel();
        return;
    }
    if (asked_ || alert_.lock())
        return;
    const auto account = Platform::current().accountManager().active();
    const std::shared_ptr<platform::ViewController> screen = freeScreen(window_);
    if (!account || !screen) {
        retry_ = Platform::current().mainQueue().timer(questionDelay, [this] { update(); });
        return;
    }
    asked_ = true;
    alert_ = askForPassword(screen, *account, *why);
}

} // namespace tavrin
