#include "platform/cloud/AccountManager.h"

#include "platform/base/Identity.h"
#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/cloud/AccountBook.h"
#include "platform/cloud/CloudService.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/cloud/StoreTakingAway.h"

#include <future>

namespace platform {
namespace {

/// How often work that waits for the main thread looks whether that waits for it.
constexpr auto closingInterval = std::chrono::milliseconds(50);

} // namespace

/// Lets what comes late find out that the manager has gone.
struct AccountManager::Alive {};

AccountManager::AccountManager(CloudService& cloud, const Folders& folders, Clock& clock,
                               MainQueue& main)
    : cloud_(cloud),
      folders_(folders),
      clock_(clock),
      main_(main),
      alive_(std::make_shared<Alive>()),
      queue_(std::string(applicationIdentifier) + ".accounts", WorkPriority::userInitiated) {
}

AccountManager::~AccountManager() {
    closing_.cancel();
}

std::vector<AccountRecord> AccountManager::accounts() const {
    return storedAccounts(folders_);
}

std::optional<AccountRecord> AccountManager::active() const {
    return readAccount(folders_).account;
}

void AccountManager::check(const SignInRequest& request, const std::shared_ptr<CancelFlag>& cancel,
                           std::function<void(const Checked& checked)> done) {
    queue_.async([this, request, cancel, done = std::move(done),
                  alive = std::weak_ptr(alive_)] {
        Checked checked{checkSignIn(request, folders_, clock_, *cancel), false};
        if (checked.answer.problem == SignInProblem::none && !checked.answer.account.user.empty())
            checked.keyring = cloud_.secrets().hasKeyring();
        answer(alive, done, std::move(checked));
    });
}

void AccountManager::signIn(const AccountRecord& account, const std::string& password,
                            SecretPlace place, std::function<void(const Failure& failure)> done) {
    queue_.async([this, account, password, place, done = std::move(done),
                  alive = std::weak_ptr(alive_)] {
        answer(alive, done, finishSignIn(account, password, place, cloud_.secrets(), folders_));
    });
}

Failure AccountManager::use(const AccountRecord& account) {
    return useAccount(folders_, account.identity);
}

void AccountManager::setPassword(const AccountRecord& account, const std::string& password,
                                 std::optional<SecretPlace> place,
                                 std::function<void(const Failure& failure)> done) {
    queue_.async([this, account, password, place, done = std::move(done),
                  alive = std::weak_ptr(alive_)] {
        answer(
            alive,
            [this, done](const Failure& stored) {
                if (!stored)
                    cloud_.sync({});
                done(stored);
            },
            cloud_.secrets().store(secretNameOf(account), secretLabelOf(account), password,
                                   place.value_or(placeOf(account))));
    });
}

SecretPlace AccountManager::placeOf(const AccountRecord& account) {
    return cloud_.secrets().isInFile(secretNameOf(account)) ? SecretPlace::file
                                                            : SecretPlace::keyring;
}

void AccountManager::signOut(const AccountRecord& account, Files files,
                             std::function<void(const SignedOut& result)> done) {
    queue_.async([this, account, files, done = std::move(done), alive = std::weak_ptr(alive_)] {
        answer(alive, done,
               files == Files::takeAway
                   ? takeAway(account)
                   : SignedOut{signOutOf(account, cloud_.secrets(), folders_), {}});
    });
}

AccountManager::SignedOut AccountManager::takeAway(const AccountRecord& account) {
    const StoreLayout layout = StoreLayout::of(folders_, account);
    const std::unique_ptr<StoreFileSystem> disk = makeRealStoreFileSystem();
    Result<std::vector<std::string>> unsent = unsentDocuments(layout, *disk, closing_);
    if (!unsent)
        return {unsent.error(), {}};
    if (!unsent->empty())
        return {makeError(ErrorCode::notUploadedYet, unsent->front()), std::move(*unsent)};
    // A password that cannot be forgotten keeps nobody signed in.
    const Failure failure = signOutOf(account, cloud_.secrets(), folders_);
    if (failure && storedAccountLike(folders_, account))
        return {failure, {}};
    // The store is in use until the service has seen that the account is gone.
    const auto seen = std::make_shared<std::promise<void>>();
    main_.async([this, seen, alive = std::weak_ptr(alive_)] {
        if (!alive.expired())
            cloud_.readAccountFile();
        seen->set_value();
    });
    const std::future<void> waited = seen->get_future();
    while (waited.wait_for(closingInterval) != std::future_status::ready)
        if (closing_.isCancelled()) // the main thread waits for this queue
            return {makeError(ErrorCode::userCancelled), {}};
    Result<std::vector<std::string>> left = takeStoreAway(layout, *disk, clock_, closing_);
    if (!left)
        return {left.error(), {}};
    return {failure, std::move(*left)};
}

} // namespace platform
