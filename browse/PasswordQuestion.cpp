#include "browse/PasswordQuestion.h"

#include "app/VXLogging.h"
#include "items/UIUtils.h"
#include "platform/Platform.h"
#include "platform/base/Text.h"
#include "platform/cloud/AccountManager.h"

namespace tavrin {
namespace {

using platform::ActionStyle;
using platform::AlertAction;
using platform::AlertController;
using platform::AlertStyle;
using platform::localized;
using platform::localizedFormat;
using platform::SecretPlace;

using Screen = std::weak_ptr<platform::ViewController>;

void keepPassword(const Screen& screen, const platform::AccountRecord& account,
                  const std::string& password, std::optional<SecretPlace> place);

/// The keyring does not take it: whether a file may.
void offerFile(const Screen& screen, const platform::AccountRecord& account,
               const std::string& password, const std::string& why) {
    const std::shared_ptr<platform::ViewController> over = screen.lock();
    if (!over)
        return;
    auto alert = AlertController::create(
        localized("Keep the Password in a File?"),
        why + ' ' +
            localized("It can lie in a file that you alone may read. The file is not encrypted: "
                      "whoever has this disk in his hands can read it."),
        AlertStyle::alert);
    alert->addAction(AlertAction::make(localized("Keep It in a File"), ActionStyle::standard,
                                       [screen, account, password](AlertAction&) {
                                           keepPassword(screen, account, password,
                                                        SecretPlace::file);
                                       }));
    alert->addAction(AlertAction::make(localized("Cancel"), ActionStyle::cancel));
    over->presentViewController(alert, true);
}

void keepPassword(const Screen& screen, const platform::AccountRecord& account,
                  const std::string& password, std::optional<SecretPlace> place) {
    platform::Platform::current().accountManager().setPassword(
        account, password, place,
        [screen, account, password, place](const platform::Failure& failure) {
            if (!failure)
                return;
            VXLOG(vxError, "The password of %@ is not kept: %@", account.name, *failure);
            if (place == SecretPlace::file)
                UIUtils::showError(failure, screen.lock());
            else
                offerFile(screen, account, password, UIUtils::bestMessage(failure));
        });
}

} // namespace

std::shared_ptr<AlertController>
askForPassword(const std::shared_ptr<platform::ViewController>& screen,
               const platform::AccountRecord& account, const std::string& why) {
    auto alert = AlertController::create(localizedFormat("Password for “%1$@”", account.name), why,
                                         AlertStyle::alert);
    const auto typed = std::make_shared<std::string>();
    alert->addTextField([typed](platform::TextField& field) {
        field.setEditingChangedHandler(
            [typed](platform::TextField& edited) { *typed = edited.text(); });
        field.setSecure(true);
        field.setPlaceholder(localized("Password"));
        field.setAccessibleName(localized("Password"));
    });
    const auto signIn = AlertAction::make(
        localized("Sign In"), ActionStyle::standard,
        [over = Screen(screen), typed, account](AlertAction&) {
            keepPassword(over, account, *typed, std::nullopt);
        });
    alert->addAction(AlertAction::make(localized("Not Now"), ActionStyle::cancel));
    alert->addAction(signIn);
    screen->presentViewController(alert, true);
    return alert;
}

} // namespace tavrin
