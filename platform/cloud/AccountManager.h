#pragma once

#include "platform/base/MainQueue.h"
#include "platform/base/WorkQueue.h"
#include "platform/cloud/SignIn.h"

#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace platform {

class CloudService;

/// Signs in and out, for the program's screens: what takes time runs on a queue of its own, and the
/// answers come on the main queue (none after the manager has gone). Main thread.
class AccountManager {
public:
    struct Checked {
        SignInAnswer answer;
        /// There is a keyring for the password.
        bool keyring = false;
    };
    struct SignedOut {
        Failure failure;
        /// Documents that are on this device alone; with a failure notUploadedYet nothing has
        /// changed because of them, without one they stayed.
        std::vector<std::string> unsent;
    };

    /// All outlive it.
    AccountManager(CloudService& cloud, const Folders& folders, Clock& clock, MainQueue& main);
    ~AccountManager();
    AccountManager(const AccountManager&) = delete;
    AccountManager& operator=(const AccountManager&) = delete;

    /// All that are signed in; see AccountBook.h.
    std::vector<AccountRecord> accounts() const;
    std::optional<AccountRecord> active() const;

    /// Looks whether one can sign in so. Cancelling ends it soon.
    void check(const SignInRequest& request, const std::shared_ptr<CancelFlag>& cancel,
               std::function<void(const Checked& checked)> done);
    /// Signs in to what was checked; it is the active account then.
    void signIn(const AccountRecord& account, const std::string& password, SecretPlace place,
                std::function<void(const Failure& failure)> done);
    /// Makes another one the active account, at once.
    [[nodiscard]] Failure use(const AccountRecord& account);
    /// Takes a new password for it, and goes on with it. Without a place it goes where the user
    /// wanted it before; unsupportedOperation when that is nowhere and there is no keyring.
    void setPassword(const AccountRecord& account, const std::string& password,
                     std::optional<SecretPlace> place,
                     std::function<void(const Failure& failure)> done);

    enum class Files { keep, takeAway };
    /// With takeAway the documents leave this device, unless some are not on the account.
    void signOut(const AccountRecord& account, Files files,
                 std::function<void(const SignedOut& result)> done);

private:
    struct Alive;
    /// Runs `done` on the main queue while there is a manager.
    template<class Done, class Answer>
    void answer(const std::weak_ptr<Alive>& alive, const Done& done, Answer value) {
        main_.async([alive, done, value = std::move(value)] {
            if (!alive.expired())
                done(value);
        });
    }
    SecretPlace placeOf(const AccountRecord& account);
    SignedOut takeAway(const AccountRecord& account);

    CloudService& cloud_;
    const Folders folders_;
    Clock& clock_;
    MainQueue& main_;
    CancelFlag closing_;
    std::shared_ptr<Alive> alive_;
    WorkQueue queue_; // last: what runs on it needs the others
};

} // namespace platform
