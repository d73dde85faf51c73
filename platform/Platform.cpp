#include "platform/Platform.h"

#include "platform/base/Identity.h"
#include "platform/base/Process.h"
#include "platform/cloud/AccountFile.h"
#include "platform/cloud/AccountManager.h"
#include "platform/cloud/CloudService.h"
#include "platform/files/DirectoryWatcher.h"
#include "platform/files/FileCoordinator.h"
#include "platform/files/FileManager.h"
#include "platform/files/Progress.h"
#include "platform/system/JotService.h"
#include "platform/system/NetworkActivityIndicator.h"
#include "platform/system/NotifyService.h"
#include "platform/system/PreferencesStore.h"
#include "platform/system/ReachabilityService.h"

#include <atomic>
#include <cstdio>
#include <cstdlib>
#include <utility>

namespace platform {
namespace {

std::atomic<Platform*> installedPlatform{nullptr}; // the main thread writes, any reads

/// Where the log lies when the machine has no journal, and notices when it has no runtime folder.
std::string stateFolder(const Folders& folders) {
    return folders.state + "/pelmora";
}

std::string noticeFolder(const Folders& folders) {
    return (folders.runtime ? *folders.runtime + "/pelmora" : stateFolder(folders)) + "/notices";
}

/// The account's remote is watched in its place; see ReachabilityService::setWatchedRemote.
constexpr const char* remoteStandIn = "www.pelmora.com";

/// The host of an authority ("user@host:port", "[::1]:80").
std::string hostOf(std::string_view authority) {
    authority.remove_prefix(authority.rfind('@') + 1); // npos + 1 is 0
    if (authority.starts_with('['))
        return std::string(authority.substr(1, authority.find(']') - 1));
    return std::string(authority.substr(0, authority.find(':')));
}

/// Where the documents of the signed-in account come from.
std::optional<WatchedRemote> remoteOf(const CloudAccountService& accounts) {
    const std::optional<AccountSummary> account = accounts.account();
    if (!account)
        return std::nullopt;
    if (account->kind == folderAccountKind)
        return WatchedRemote{account->address, {}};
    const std::optional<Url> server = Url::parse(account->address);
    // An address that names no host is nowhere: no name stands for it, and nothing resolves "".
    return WatchedRemote{{}, server ? hostOf(server->host()) : std::string()};
}

} // namespace

PlatformParts::PlatformParts() = default;
PlatformParts::~PlatformParts() = default;
PlatformParts::PlatformParts(PlatformParts&& other) noexcept = default;
PlatformParts& PlatformParts::operator=(PlatformParts&& other) noexcept = default;

/// Members in the order in which they need each other.
struct Platform::State {
    explicit State(PlatformParts parts)
        : clock(parts.clock ? std::move(parts.clock) : makeRealClock()),
          main(*clock),
          runtime{*clock, main, notifications,
                  parts.folders ? *parts.folders : Folders::fromProcessEnvironment()},
          installation(runtime),
          jot(std::move(parts.jot)),
          notify(std::move(parts.notify)),
          preferences(std::move(parts.preferences)),
          reachability(std::move(parts.reachability)),
          marker(std::move(parts.markerExists)) {
        if (!jot)
            jot = makeJotService(stateFolder(runtime.folders), clock.get());
        if (!notify)
            notify = makeNotifyService(noticeFolder(runtime.folders), parts.managedSettingsFile);
        if (!preferences)
            preferences = makeFilePreferences(runtime.folders.config, parts.managedSettingsFile);
        standardPreferences = std::make_unique<StandardPreferences>(*preferences);
        cloud = std::make_unique<CloudService>(CloudService::Parts{
            *clock, main, notifications, watcher, progress, runtime.folders, false, nullptr, {},
            std::move(parts.secrets)});
        accountManager =
            std::make_unique<AccountManager>(*cloud, runtime.folders, *clock, main);
        FileCoordinator::setContentProvider(&cloud->contents());
        if (!reachability)
            reachability = makeReachability(*clock, environmentVariable("PELMORA_NETWORK"));
        const auto followAccount = [this](const Notification&) {
            reachability->setWatchedRemote(remoteOf(cloud->accounts()));
        };
        accountChanged = notifications.observe(cloudIdentityDidChangeNotification, followAccount);
        followAccount({});
        followNetwork();
    }

    ~State() {
        if (!remoteReach)
            return;
        remoteReach->setCallback({});
        remoteReach->setQueue(nullptr);
    }

    /// What nobody waits for is not transferred where the network costs.
    void followNetwork() {
        remoteReach = reachability->createTarget(remoteStandIn);
        if (!remoteReach)
            return;
        remoteReach->setCallback([this](std::uint32_t flags) {
            main.async([this, flags] {
                if (cloud)
                    cloud->setMetered((flags & reachabilityCellular) != 0);
            });
        });
        remoteReach->setQueue(std::make_shared<WorkQueue>(
            std::string(applicationIdentifier) + ".cloud.network"));
    }

    /// The lowest floor finds the runtime for as long as anything here lives.
    struct Installation {
        explicit Installation(Runtime& runtime) { Runtime::install(&runtime); }
        ~Installation() { Runtime::install(nullptr); }
        Installation(const Installation&) = delete;
        Installation& operator=(const Installation&) = delete;
    };

    std::unique_ptr<Clock> clock;
    MainQueue main;
    NotificationCenter notifications;
    Runtime runtime;
    Installation installation;
    std::unique_ptr<JotService> jot;
    std::unique_ptr<NotifyService> notify;
    std::unique_ptr<PreferencesStore> preferences;
    std::unique_ptr<StandardPreferences> standardPreferences;
    std::unique_ptr<ReachabilityService> reachability;
    NetworkActivityIndicator networkActivity;
    std::function<bool(const std::string& path)> marker;
    DirectoryWatcher watcher;
    FileProgressSubscription progress;
    std::unique_ptr<CloudService> cloud;
    std::unique_ptr<AccountManager> accountManager;
    std::unique_ptr<ReachabilityTarget> remoteReach;
    Observation accountChanged;
};

Platform::Platform(PlatformParts parts) : state_(std::make_unique<State>(std::move(parts))) {
    installedPlatform = this;
}

Platform::~Platform() {
    FileCoordinator::setContentProvider(nullptr);
    state_->accountManager.reset();
    state_->cloud.reset();  // what ends with it may still ask for the others
    state_->notify.reset(); // its handlers use the platform
    FileCoordinator::waitUntilIdle();
    installedPlatform = nullptr;
}

Platform& Platform::current() {
    Platform* const installed = installedPlatform;
    if (!installed) {
        std::fputs("platform: used before it was installed\n", stderr);
        std::abort();
    }
    return *installed;
}

bool Platform::installed() {
    return installedPlatform != nullptr;
}

Runtime& Platform::runtime() {
    return state_->runtime;
}

JotService& Platform::jot() {
    return *state_->jot;
}

NotifyService& Platform::notify() {
    return *state_->notify;
}

PreferencesStore& Platform::preferences() {
    return *state_->preferences;
}

StandardPreferences& Platform::standardPreferences() {
    return *state_->standardPreferences;
}

DirectoryWatcher& Platform::directoryWatcher() {
    return state_->watcher;
}

FileProgressSubscription& Platform::fileProgress() {
    return state_->progress;
}

ReachabilityService& Platform::reachability() {
    return *state_->reachability;
}

NetworkActivityIndicator& Platform::networkActivityIndicator() {
    return state_->networkActivity;
}

CloudService& Platform::cloud() {
    return *state_->cloud;
}

CloudAccountService& Platform::accounts() {
    return state_->cloud->accounts();
}

AccountManager& Platform::accountManager() {
    return *state_->accountManager;
}

CloudDocumentService& Platform::documents() {
    return state_->cloud->documents();
}

KeyValueCloudStore& Platform::keyValueStore() {
    return state_->cloud->keyValues();
}

CloudDatabase& Platform::privateDatabase(std::string_view /*containerIdentifier*/) {
    // An account has one limit, whichever container asks.
    return state_->cloud->database();
}

std::optional<Url> Platform::dataContainerURL(std::string_view application) const {
    if (application.empty() || application.find('/') != std::string_view::npos)
        return std::nullopt;
    return Url::file(state_->runtime.folders.data + '/' + std::string(application), true);
}

bool Platform::markerExists(const std::string& path) const {
    return state_->marker ? state_->marker(path) : FileManager::exists(path);
}

} // namespace platform
