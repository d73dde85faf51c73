#pragma once

#include "browse/AccountReport.h"
#include "browse/FormView.h"
#include "platform/base/MainQueue.h"
#include "platform/base/NotificationCenter.h"
#include "platform/base/WorkQueue.h"
#include "platform/cloud/AccountManager.h"
#include "platform/ui/AlertController.h"

#include <array>
#include <memory>
#include <string>
#include <vector>

namespace tavrin {

/// Who is signed in, and where; what is being sent and received, what waits and why, what needs a
/// decision; other accounts, and the way out. Follows all of it while it is in sight.
class AccountViewController : public platform::ViewController {
public:
    static std::shared_ptr<AccountViewController> create();
    ~AccountViewController() override;

    void loadView() override;
    void viewWillAppear(bool animated) override;
    void viewWillDisappear(bool animated) override;
    bool performKeyCommand(platform::KeyCommand command) override;

private:
    /// A heading with text below it, and the buttons that belong to it.
    struct Section {
        std::shared_ptr<platform::Label> heading;
        std::shared_ptr<platform::Label> text;
        std::vector<std::shared_ptr<platform::Button>> buttons;
        void show(const std::string& words) const;
    };

    AccountViewController();
    std::shared_ptr<AccountViewController> self();
    Section addSection(std::string_view heading);
    std::shared_ptr<platform::Button>
    addButton(std::string_view title, FormView::Look look,
              void (AccountViewController::*action)());
    void addDecisions();
    void addOtherAccounts();

    /// Asks for a new report; the screen shows it when it comes.
    void refresh();
    void show(const AccountReport& report);
    std::string stateText(const AccountReport& report) const;

    void syncNow();
    void givePassword();
    void bringBack();
    void deleteThem();
    void answer(platform::DeletionAnswer answer);
    void showConflict();
    void addAccount();
    // AccountViewControllerSigningOut.cpp
    void signOut();
    void signOutWith(platform::AccountManager::Files files);
    void signedOut(const platform::AccountManager::SignedOut& result);
    void tellUnsent(const std::vector<std::string>& unsent);

    std::optional<platform::AccountRecord> account_;
    std::shared_ptr<FormView> form_;
    std::shared_ptr<platform::Label> state_;
    Section transfers_;
    Section waiting_;
    Section password_;
    Section vanished_;
    Section conflicts_;
    Section refused_;
    std::shared_ptr<platform::Button> signOut_;
    AccountReport report_;
    bool syncing_ = false;
    bool inSight_ = false;
    bool asking_ = false; // for a report
    std::array<platform::Observation, 2> observations_;
    platform::Timer next_;
    std::unique_ptr<platform::WorkQueue> queue_; // reports, and answers that wait for the store
};

} // namespace tavrin
