#pragma once

#include "browse/FormView.h"
#include "platform/cloud/AccountManager.h"
#include "platform/ui/AlertController.h"

#include <memory>
#include <string>

namespace tavrin {

/// The screen that signs in: to a folder, or to a server with address, user and password. The place
/// is looked at first; what is wrong with it is said below the fields, and nothing is kept. When it
/// has gone well the account is another one, and the lists take this screen's place.
class SignInViewController : public platform::ViewController {
public:
    enum class Kind { folder, server };
    static std::shared_ptr<SignInViewController> create(Kind kind);

    void loadView() override;
    void viewDidAppear(bool animated) override;
    /// Who leaves does not want to be signed in any more.
    void viewWillDisappear(bool animated) override;
    bool performKeyCommand(platform::KeyCommand command) override;

private:
    explicit SignInViewController(Kind kind) : kind_(kind) {}
    std::shared_ptr<SignInViewController> self();
    void addServerFields();
    /// Enter leads from field to field, and from the last one on.
    void linkFields();
    platform::SignInRequest request() const;
    /// The first thing that is missing, with its field; none when nothing is.
    const platform::TextField* missing(std::string& words) const;

    void submit();
    void check();
    void stopCheck();
    void checked(const platform::AccountManager::Checked& checked);
    void showProblem(const platform::SignInAnswer& answer);
    /// Asks whether the password may lie in a file.
    void askForFile(const platform::AccountRecord& account, const std::string& why);
    void finish(const platform::AccountRecord& account, platform::SecretPlace place);
    void finished(const platform::AccountRecord& account, platform::SecretPlace place,
                  const platform::Failure& failure);
    void leave();
    void say(std::string_view words, bool wrong);
    void setBusy(bool busy);
    void ask(std::string_view title, std::string_view message, std::string_view agree,
             std::function<void()> agreed);

    const Kind kind_;
    std::shared_ptr<FormView> form_;
    std::shared_ptr<platform::TextField> place_;
    std::shared_ptr<platform::TextField> user_;
    std::shared_ptr<platform::TextField> password_;
    std::shared_ptr<platform::TextField> authorities_;
    std::shared_ptr<platform::Label> message_;
    std::shared_ptr<platform::Button> signIn_;
    std::shared_ptr<platform::Button> stop_;
    std::shared_ptr<platform::CancelFlag> cancel_; // of the check that runs; none otherwise
    bool clearTextAgreed_ = false;
    bool busy_ = false;
};

} // namespace tavrin
