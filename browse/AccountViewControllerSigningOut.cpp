#include "app/VXLogging.h"
#include "browse/AccountViewController.h"
#include "items/UIUtils.h"
#include "platform/Platform.h"
#include "platform/base/Text.h"
#include "platform/ui/NavigationController.h"

namespace tavrin {
namespace {

using platform::ActionStyle;
using platform::AlertAction;
using platform::localized;
using platform::localizedFormat;
using platform::Platform;
using Files = platform::AccountManager::Files;

constexpr std::size_t unsentNamed = 5;

} // namespace

void AccountViewController::signOut() {
    if (!account_)
        return;
    auto alert = platform::AlertController::create(
        localizedFormat("Sign Out of “%1$@”?", account_->name),
        localized("The account keeps its documents. Those on this device can stay in their folder "
                  "or be removed."),
        platform::AlertStyle::alert);
    const auto add = [&](std::string_view title, ActionStyle style, Files files) {
        alert->addAction(
            AlertAction::make(title, style, [weak = std::weak_ptr(self()), files](AlertAction&) {
                if (const auto screen = weak.lock())
                    screen->signOutWith(files);
            }));
    };
    add(localized("Keep Files on This Device"), ActionStyle::standard, Files::keep);
    add(localized("Remove Files from This Device"), ActionStyle::destructive, Files::takeAway);
    alert->addAction(AlertAction::make(localized("Cancel"), ActionStyle::cancel));
    presentViewController(alert, true);
}

void AccountViewController::signOutWith(Files files) {
    VXLOG(vxInfo, "Signing out of %@", account_->name);
    signOut_->setEnabled(false);
    // What stays is told also after the account, and this screen with it, has gone.
    const std::weak_ptr<platform::ViewController> window =
        navigationController() ? navigationController()->weak_from_this()
                               : std::weak_ptr<platform::ViewController>();
    Platform::current().accountManager().signOut(
        *account_, files,
        [weak = std::weak_ptr(self()),
         window](const platform::AccountManager::SignedOut& result) {
            if (const auto screen = weak.lock(); screen && screen->navigationController())
                screen->signedOut(result);
            else if (const auto over = window.lock(); over && !result.unsent.empty())
                UIUtils::showAlert(localized("Some Documents Stayed on This Device"),
                                   linesOf(result.unsent, unsentNamed), over);
            else if (over && result.failure)
                UIUtils::showError(result.failure, over);
        });
}

void AccountViewController::signedOut(const platform::AccountManager::SignedOut& result) {
    signOut_->setEnabled(true);
    if (result.failure && !result.unsent.empty())
        tellUnsent(result.unsent);
    else if (result.failure)
        UIUtils::showError(result.failure, self());
}

void AccountViewController::tellUnsent(const std::vector<std::string>& unsent) {
    auto alert = platform::AlertController::create(
        localized("Not Everything Has Been Sent"),
        localized("These are on this device alone, so nothing was removed:") + '\n' +
            linesOf(unsent, unsentNamed),
        platform::AlertStyle::alert);
    alert->addAction(AlertAction::make(localized("Keep Files and Sign Out"), ActionStyle::standard,
                                       [weak = std::weak_ptr(self())](AlertAction&) {
                                           if (const auto screen = weak.lock())
                                               screen->signOutWith(Files::keep);
                                       }));
    alert->addAction(AlertAction::make(localized("Stay Signed In"), ActionStyle::cancel));
    presentViewController(alert, true);
}

} // namespace tavrin
