#include "platform/Platform.h"

#include "platform/cloud/CloudService.h"
#include "platform/files/DirectoryWatcher.h"
#include "platform/files/FileCoordinator.h"
#include "platform/files/FileManager.h"
#include "platform/files/Progress.h"
#include "platform/system/JotService.h"
#include "platform/system/NotifyService.h"
#include "platform/system/PreferencesStore.h"

#include <cstdio>
#include <cstdlib>
#include <utility>

namespace platform {
namespace {

Platform* installedPlatform = nullptr; // main thread writes; see Platform's own contract

/// Where the log lies when the machine has no journal, and notices when it has no runtime folder.
std::string stateFolder(const Folders& folders) {
    return folders.state + "/pelmora";
}

std::string noticeFolder(const Folders& folders) {
    return (folders.runtime ? *folders.runtime + "/pelmora" : stateFolder(folders)) + "/notices";
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
          marker(std::move(parts.markerExists)) {
        if (!jot)
            jot = makeJotService(stateFolder(runtime.folders), clock.get());
        if (!notify)
            notify = makeNotifyService(noticeFolder(runtime.folders), parts.managedSettingsFile);
        if (!preferences)
            preferences = makeFilePreferences(runtime.folders.config, parts.managedSettingsFile);
        standardPreferences = std::make_unique<StandardPreferences>(*preferences);
        cloud = std::make_unique<CloudService>(CloudService::Parts{
            *clock, main, notifications, watcher, progress, runtime.folders, false, nullptr, {}});
        FileCoordinator::setContentProvider(&cloud->contents());
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
    std::function<bool(const std::string& path)> marker;
    DirectoryWatcher watcher;
    FileProgressSubscription progress;
    std::unique_ptr<CloudService> cloud;
};

Platform::Platform(PlatformParts parts) : state_(std::make_unique<State>(std::move(parts))) {
    installedPlatform = this;
}

Platform::~Platform() {
    FileCoordinator::setContentProvider(nullptr);
    state_->cloud.reset(); // what ends with it may still ask for the others
    installedPlatform = nullptr;
}

Platform& Platform::current() {
    if (!installedPlatform) {
        std::fputs("platform: used before it was installed\n", stderr);
        std::abort();
    }
    return *installedPlatform;
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

CloudService& Platform::cloud() {
    return *state_->cloud;
}

CloudAccountService& Platform::accounts() {
    return state_->cloud->accounts();
}

CloudDocumentService& Platform::documents() {
    return state_->cloud->documents();
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
