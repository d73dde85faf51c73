#pragma once

#include "platform/base/Folders.h"
#include "platform/base/Result.h"
#include "platform/cloud/CloudAccountService.h"
#include "platform/cloud/CloudDocumentService.h"
#include "platform/cloud/QuotaOperation.h"
#include "platform/cloud/SyncState.h"

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>

namespace platform {

class Clock;
class ContentProvider;
class DirectoryWatcher;
class FileProgressSubscription;
class KeyValueCloudStore;
class MainQueue;
class NotificationCenter;
class Remote;
class SecretStore;
class StoreFileSystem;
struct AccountRecord;
struct TransferInfo;

/// What people may want to know of the store of the account.
struct CloudStatus {
    /// The account's folder, with Shelfroot in it.
    std::string folder;
    /// The first listing has come to its end.
    bool listed = false;
    std::int64_t folders = 0;
    std::int64_t files = 0;
    /// Of the files, those that are only promised.
    std::int64_t promises = 0;
    /// Bytes of all files.
    std::int64_t bytes = 0;
    /// Items of the remote that cannot be on this device.
    std::int64_t refused = 0;
    /// So much has vanished that the user is to say what it means; until then nothing is brought
    /// from one side to the other.
    std::optional<DeletionQuestion> question;
};

/// The owner of accounts, store and transfers: everybody else speaks to it by values in and events
/// out. Made, destroyed and called on the main thread, except where told.
class CloudService {
public:
    struct Parts {
        Clock& clock;
        MainQueue& main;
        NotificationCenter& notifications;
        DirectoryWatcher& watcher;
        FileProgressSubscription& progress;
        Folders folders;
        /// Look at the store, and change nothing.
        bool readOnly = false;
        /// Empty: the real disk.
        std::shared_ptr<StoreFileSystem> disk;
        /// Empty: the kinds that this version knows.
        std::function<std::unique_ptr<Remote>(const AccountRecord& account)> remotes;
        /// Empty: the desk's.
        std::shared_ptr<SecretStore> secrets = {};
    };
    explicit CloudService(Parts parts);
    ~CloudService();
    CloudService(const CloudService&) = delete;
    CloudService& operator=(const CloudService&) = delete;

    CloudAccountService& accounts();
    /// Safe from any thread.
    CloudDocumentService& documents();
    /// For the file coordinator. Safe from any thread.
    ContentProvider& contents();
    /// Safe from any thread.
    KeyValueCloudStore& keyValues();
    /// For questions of quota.
    CloudDatabase& database();

    /// Brings in what is new on the remote: in that folder, or everywhere. `done` runs on a thread
    /// of the service's when it has come to its end.
    void refresh(const std::optional<Url>& folder,
                 std::function<void(const Failure& failure)> done);
    /// Makes both sides agree now, whatever has failed before; `done` as above.
    void sync(std::function<void(const Failure& failure)> done);
    /// So much has vanished that the user is to say what it means, as in CloudStatus. Waits for
    /// nothing; cloudProblemDidChangeNotification tells of a change.
    std::optional<DeletionQuestion> question() const;
    /// Answers the question that CloudStatus tells of; waits for the store's queue; what follows from it is done soon.
    [[nodiscard]] Failure answer(DeletionAnswer answer);
    /// What could not be done yet, and why.
    std::vector<PendingWork> pending() const;
    /// Documents that were changed on both sides, under the names that tell of it: relative to the
    /// store.
    std::vector<std::string> conflicts() const;
    /// None without an account whose store can be read.
    std::optional<CloudStatus> status() const;
    /// Names that one side has and the other cannot hold, with the reasons, at most so many.
    std::vector<RefusedRow> refusedNames(std::size_t atMost) const;

    /// What is being sent and received now. cloudActivityDidChangeNotification tells when one
    /// begins or ends, not how far it is.
    std::vector<TransferInfo> transfers() const;
    /// The network costs: what nobody waits for is not transferred before that is over. A command
    /// (sync) and what the user opens are.
    void setMetered(bool metered);

    /// Why somebody has to give the password of the account before anything goes on, in the user's
    /// language; none while nobody has to. cloudProblemDidChangeNotification tells of a change.
    std::optional<std::string> passwordWanted() const;
    SecretStore& secrets();
    /// Follows a change of the account file now, before its notice comes.
    void readAccountFile();

private:
    struct State;
    std::shared_ptr<State> state_; // shared with nobody but what waits on the main queue
};

} // namespace platform
