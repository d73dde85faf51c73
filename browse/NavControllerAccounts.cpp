#include "app/VXLogging.h"
#include "browse/AccountViewController.h"
#include "browse/NavController.h"
#include "platform/Platform.h"
#include "platform/base/Text.h"
#include "platform/cloud/AccountManager.h"
#include "platform/documents/DocumentPickerUnavailableViewController.h"
#include "platform/ui/Theme.h"

namespace tavrin {
namespace {

using platform::localized;
using platform::localizedFormat;
using platform::Platform;
using Placeholder = platform::DocumentPickerUnavailableViewController;

/// Accounts that wait to be used again, of which the placeholder screen offers so many.
constexpr std::size_t accountsOffered = 3;

} // namespace

void NavController::offerSignIn(Placeholder& placeholder) {
    std::vector<Placeholder::Choice> choices;
    const auto weak = std::weak_ptr(self());
    for (const auto kind :
         {SignInViewController::Kind::server, SignInViewController::Kind::folder})
        choices.push_back({localized(kind == SignInViewController::Kind::server
                                         ? "Sign In to a Server…"
                                         : "Use a Folder…"),
                           [weak, kind] {
                               if (const auto screen = weak.lock())
                                   screen->showSignIn(kind);
                           }});
    for (const platform::AccountRecord& account : Platform::current().accountManager().accounts())
        if (choices.size() < 2 + accountsOffered)
            choices.push_back({localizedFormat("Use “%1$@”", account.name), [account] {
                                   if (const auto failure =
                                           Platform::current().accountManager().use(account))
                                       VXLOG(vxError, "Cannot use %@: %@", account.name, *failure);
                               }});
    placeholder.setChoices(std::move(choices));
}

void NavController::showSignIn(SignInViewController::Kind kind) {
    setToolbarHidden(true, true);
    pushViewController(SignInViewController::create(kind), true);
}

void NavController::showAccount() {
    if (editMode_ || !checkPelmoraState() ||
        std::dynamic_pointer_cast<AccountViewController>(topViewController()))
        return;
    // A preview ends here: the way back leads to its list.
    std::vector<std::shared_ptr<ViewController>> stack;
    for (const auto& screen : viewControllers())
        if (std::dynamic_pointer_cast<List>(screen))
            stack.push_back(screen);
    stack.push_back(AccountViewController::create());
    endPreview();
    setToolbarHidden(true, true);
    setViewControllers(std::move(stack), true);
}

platform::BarButtonItem::Pointer NavController::makeAccountButton() {
    return platform::BarButtonItem::withImage(
        platform::Image::named("ui-account").tinted(platform::Theme::accent),
        localized("Account"), [weak = std::weak_ptr(self())](platform::BarButtonItem&) {
            if (const auto screen = weak.lock())
                screen->showAccount();
        });
}

} // namespace tavrin
