#pragma once

#include "platform/base/Runtime.h"
#include "platform/base/Url.h"

#include <functional>
#include <memory>
#include <optional>
#include <string>

namespace platform {

class AccountManager;
class CloudAccountService;
class CloudDatabase;
class CloudDocumentService;
class CloudService;
class DirectoryWatcher;
class FileProgressSubscription;
class JotService;
class KeyValueCloudStore;
class NetworkActivityIndicator;
class NotifyService;
class PreferencesStore;
class ReachabilityService;
class SecretStore;
class StandardPreferences;

/// What a platform is put together from. Empty slots get the real thing.
struct PlatformParts {
    PlatformParts();
    ~PlatformParts();
    PlatformParts(PlatformParts&& other) noexcept;
    PlatformParts& operator=(PlatformParts&& other) noexcept;

    std::unique_ptr<Clock> clock;
    std::optional<Folders> folders;
    std::unique_ptr<JotService> jot;
    std::unique_ptr<NotifyService> notify;
    std::unique_ptr<PreferencesStore> preferences;
    std::unique_ptr<ReachabilityService> reachability;
    std::shared_ptr<SecretStore> secrets;
    /// Where an administrator's settings lie.
    std::string managedSettingsFile = "/etc/tavrin/managed-settings.json";
    /// Answers whether a file exists, for marker files outside the user's folders.
    std::function<bool(const std::string& path)> markerExists;
};

/// The one global: the services that the product runs on. The process entry installs the real one,
/// a test one on a temporary folder with a manual clock. Made and destroyed on the main thread;
/// found from any.
class Platform {
public:
    explicit Platform(PlatformParts parts = {});
    ~Platform();
    Platform(const Platform&) = delete;
    Platform& operator=(const Platform&) = delete;

    static Platform& current();
    static bool installed();

    Runtime& runtime();
    Clock& clock() { return runtime().clock; }
    MainQueue& mainQueue() { return runtime().mainQueue; }
    NotificationCenter& notifications() { return runtime().notifications; }
    JotService& jot();
    NotifyService& notify();
    PreferencesStore& preferences();
    StandardPreferences& standardPreferences();
    DirectoryWatcher& directoryWatcher();
    FileProgressSubscription& fileProgress();
    ReachabilityService& reachability();
    NetworkActivityIndicator& networkActivityIndicator();
    CloudService& cloud();
    CloudAccountService& accounts();
    AccountManager& accountManager();
    CloudDocumentService& documents();
    KeyValueCloudStore& keyValueStore();
    /// The private database of the container with that identifier.
    CloudDatabase& privateDatabase(std::string_view containerIdentifier);

    /// The data container of an application: a folder of its own in the user's data folder.
    std::optional<Url> dataContainerURL(std::string_view application) const;
    bool markerExists(const std::string& path) const;

private:
    struct State;
    std::unique_ptr<State> state_;
};

} // namespace platform
