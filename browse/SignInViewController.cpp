#include "browse/SignInViewController.h"

#include "app/VXLogging.h"
#include "items/UIUtils.h"
#include "platform/Platform.h"
#include "platform/base/Text.h"
#include "platform/ui/NavigationController.h"
#include "platform/ui/Theme.h"

#include <utility>
#include <vector>

namespace tavrin {
namespace {

using platform::ActionStyle;
using platform::AlertAction;
using platform::localized;
using platform::localizedFormat;
using platform::Platform;
using platform::SecretPlace;
using platform::SignInProblem;
using platform::TextStyle;
using platform::Theme;

constexpr double textGap = 12;

} // namespace

std::shared_ptr<SignInViewController> SignInViewController::create(Kind kind) {
    const std::shared_ptr<SignInViewController> screen(new SignInViewController(kind));
    screen->setTitle(localized(kind == Kind::server ? "Server" : "Folder"));
    return screen;
}

std::shared_ptr<SignInViewController> SignInViewController::self() {
    return std::static_pointer_cast<SignInViewController>(shared_from_this());
}

void SignInViewController::loadView() {
    form_ = std::make_shared<FormView>();
    const bool server = kind_ == Kind::server;
    form_->addText(TextStyle::subheadline, Theme::secondaryText, 0)
        ->setText(localized(server ? "Your documents stay on a WebDAV server, such as one of your "
                                     "own or your company's."
                                   : "Your documents stay in a folder of this machine, of a disk, "
                                     "or of a network."));
    place_ = form_->addField(localized(server ? "Address" : "Path of the Folder"));
    place_->setPlaceholder(server ? "https://cloud.example.org/dav/" : "/media/disk/Documents");
    if (server)
        addServerFields();
    message_ = form_->addText(TextStyle::footnote, Theme::secondaryText, textGap);
    message_->setHidden(true);
    const std::weak_ptr<SignInViewController> weak = self();
    signIn_ = form_->addButton(localized("Sign In"), FormView::Look::primary, [weak] {
        if (const auto screen = weak.lock())
            screen->submit();
    });
    stop_ = form_->addButton(localized("Cancel"), FormView::Look::plain, [weak] {
        if (const auto screen = weak.lock())
            screen->performKeyCommand(platform::KeyCommand::cancel);
    });
    linkFields();
    setView(form_);
}

void SignInViewController::addServerFields() {
    user_ = form_->addField(localized("User"));
    password_ = form_->addField(localized("Password"));
    password_->setSecure(true);
    authorities_ = form_->addField(localized("File of Certificates to Trust"));
    form_->setFieldHidden(*authorities_, true);
}

void SignInViewController::linkFields() {
    std::vector<std::shared_ptr<platform::TextField>> fields;
    for (const auto& field : {place_, user_, password_})
        if (field)
            fields.push_back(field);
    if (authorities_)
        authorities_->setReturnHandler([weak = std::weak_ptr(self())](platform::TextField&) {
            if (const auto screen = weak.lock())
                screen->submit();
        });
    for (std::size_t i = 0; i < fields.size(); ++i)
        fields[i]->setReturnHandler(
            [weak = std::weak_ptr(self()),
             next = i + 1 < fields.size() ? std::weak_ptr(fields[i + 1])
                                          : std::weak_ptr<platform::TextField>()](auto&) {
                const auto screen = weak.lock();
                if (const auto field = next.lock(); screen && field && field->text().empty())
                    field->becomeFirstResponder();
                else if (screen)
                    screen->submit();
            });
}

void SignInViewController::viewDidAppear(bool animated) {
    ViewController::viewDidAppear(animated);
    place_->becomeFirstResponder();
}

void SignInViewController::viewWillDisappear(bool animated) {
    ViewController::viewWillDisappear(animated);
    if (cancel_)
        cancel_->cancel();
}

bool SignInViewController::performKeyCommand(platform::KeyCommand command) {
    if (command == platform::KeyCommand::confirm) {
        submit();
        return true;
    }
    if (command != platform::KeyCommand::cancel)
        return ViewController::performKeyCommand(command);
    if (cancel_)
        stopCheck();
    else if (!busy_)
        leave();
    return true;
}

void SignInViewController::stopCheck() {
    std::exchange(cancel_, nullptr)->cancel();
    setBusy(false);
    say("", false);
    place_->becomeFirstResponder();
}

platform::SignInRequest SignInViewController::request() const {
    platform::SignInRequest request;
    request.kind =
        kind_ == Kind::server ? platform::webDavAccountKind : platform::folderAccountKind;
    request.address = place_->text();
    if (kind_ == Kind::server) {
        request.user = user_->text();
        request.password = password_->text();
        request.authorities = authorities_->text();
    }
    return request;
}

const platform::TextField* SignInViewController::missing(std::string& words) const {
    if (place_->text().empty()) {
        words = localized(kind_ == Kind::server ? "Give the address of the server."
                                                : "Give the folder of the account.");
        return place_.get();
    }
    if (kind_ == Kind::server && user_->text().empty()) {
        words = localized("Give the name of the user.");
        return user_.get();
    }
    return nullptr;
}

void SignInViewController::submit() {
    if (busy_)
        return;
    std::string words;
    if (const platform::TextField* const field = missing(words)) {
        say(words, true);
        const_cast<platform::TextField*>(field)->becomeFirstResponder();
        return;
    }
    if (!clearTextAgreed_ && platform::sendsInTheClear(request()))
        ask(localized("The Way to This Server Is Not Encrypted"),
            localized("Everybody on the way can read the password and the documents. Use an "
                      "address that begins with “https://” if the server has one."),
            localized("Sign In Anyway"), [weak = std::weak_ptr(self())] {
                if (const auto screen = weak.lock()) {
                    screen->clearTextAgreed_ = true;
                    screen->submit();
                }
            });
    else
        check();
}

void SignInViewController::check() {
    cancel_ = std::make_shared<platform::CancelFlag>();
    setBusy(true);
    say(localized(kind_ == Kind::server ? "Looking at the server…" : "Looking at the folder…"),
        false);
    Platform::current().accountManager().check(
        request(), cancel_,
        [weak = std::weak_ptr(self()),
         flag = cancel_](const platform::AccountManager::Checked& checked) {
            // After Escape nobody waits for it any more.
            if (const auto screen = weak.lock(); screen && screen->cancel_ == flag)
                screen->checked(checked);
        });
}

void SignInViewController::checked(const platform::AccountManager::Checked& checked) {
    cancel_.reset();
    const platform::SignInAnswer& answer = checked.answer;
    if (answer.problem != SignInProblem::none) {
        setBusy(false);
        showProblem(answer);
    } else if (checked.keyring || answer.account.user.empty()) {
        finish(answer.account, SecretPlace::keyring);
    } else {
        askForFile(answer.account, localized("There is no keyring on this desk that could keep the "
                                             "password."));
    }
}

void SignInViewController::showProblem(const platform::SignInAnswer& answer) {
    VXLOG(vxWarning, "Signing in failed: %@", *answer.failure);
    say(UIUtils::bestMessage(answer.failure), true);
    if (answer.problem == SignInProblem::certificate && authorities_)
        form_->setFieldHidden(*authorities_, false);
    if (answer.problem == SignInProblem::password && password_)
        password_->becomeFirstResponder();
    else
        place_->becomeFirstResponder();
}

void SignInViewController::askForFile(const platform::AccountRecord& account,
                                      const std::string& why) {
    setBusy(false);
    say("", false);
    ask(localized("Keep the Password in a File?"),
        why + ' ' +
            localized("It can lie in a file that you alone may read. The file is not encrypted: "
                      "whoever has this disk in his hands can read it."),
        localized("Keep It in a File"), [weak = std::weak_ptr(self()), account] {
            if (const auto screen = weak.lock())
                screen->finish(account, SecretPlace::file);
        });
}

void SignInViewController::finish(const platform::AccountRecord& account, SecretPlace place) {
    setBusy(true);
    say(localized("Signing in…"), false);
    Platform::current().accountManager().signIn(
        account, password_ ? password_->text() : std::string(), place,
        [weak = std::weak_ptr(self()), account, place](const platform::Failure& failure) {
            if (const auto screen = weak.lock())
                screen->finished(account, place, failure);
        });
}

void SignInViewController::finished(const platform::AccountRecord& account, SecretPlace place,
                                    const platform::Failure& failure) {
    setBusy(false);
    if (!failure) {
        VXLOG(vxInfo, "Signed in to %@", account.address);
        leave(); // the lists may have taken its place already
        return;
    }
    if (place == SecretPlace::keyring && !account.user.empty()) {
        askForFile(account, UIUtils::bestMessage(failure));
        return;
    }
    say(UIUtils::bestMessage(failure), true);
}

void SignInViewController::leave() {
    platform::NavigationController* const stack = navigationController();
    if (stack && stack->topViewController().get() == this && stack->viewControllers().size() > 1)
        stack->popViewController(true);
}

void SignInViewController::say(std::string_view words, bool wrong) {
    message_->setTextColor(wrong ? Theme::destructive : Theme::secondaryText);
    message_->setText(words);
    message_->setHidden(words.empty());
}

void SignInViewController::setBusy(bool busy) {
    busy_ = busy;
    for (const auto& field : {place_, user_, password_, authorities_})
        if (field)
            field->setEnabled(!busy);
    signIn_->setEnabled(!busy);
}

void SignInViewController::ask(std::string_view title, std::string_view message,
                               std::string_view agree, std::function<void()> agreed) {
    auto alert =
        platform::AlertController::create(title, message, platform::AlertStyle::alert);
    alert->addAction(AlertAction::make(
        agree, ActionStyle::standard,
        [agreed = std::move(agreed)](AlertAction&) { agreed(); }));
    alert->addAction(AlertAction::make(localized("Cancel"), ActionStyle::cancel));
    presentViewController(alert, true);
}

} // namespace tavrin
