#include "tests/product/ProductHouse.h"

#include "app/VXLogging.h"
#include "platform/base/Process.h"
#include "platform/cloud/AccountFile.h"
#include "platform/cloud/CloudAccountService.h"
#include "platform/system/ReachabilityService.h"
#include "services/NetworkWatcher.h"
#include "tests/product/LogCapture.h"

#include <gtest/gtest.h>

#include <filesystem>

namespace test {
namespace {

constexpr auto networkScript = "network";

/// The machine's types and pictures without its applications: which of them are installed must not
/// decide what a tap does.
struct DeskWithoutApplications {
    DeskWithoutApplications() {
        for (const std::string name : {"mime", "icons", "themes"})
            std::filesystem::create_directory_symlink("/usr/share/" + name, share / name);
        platform::setEnvironmentVariable("XDG_DATA_DIRS", share.path());
        platform::setEnvironmentVariable("XDG_CONFIG_DIRS", share.path());
    }
    TemporaryFolder share;
};

} // namespace

ProductHouse::ProductHouse() {
    static const DeskWithoutApplications desk;
    home.write(networkScript, "wifi");
    adjustParts = [this](platform::PlatformParts& parts) {
        parts.jot = std::make_unique<CapturingJot>();
        parts.reachability = platform::makeScriptedReachability("file:" + (home / networkScript));
        parts.markerExists = [](const std::string&) { return false; };
        parts.managedSettingsFile = home / "managed-settings.json";
    };
}

ProductHouse::~ProductHouse() {
    // The watcher and the log client are the process's own and outlive this platform.
    tavrin::NetworkWatcher::sharedNetworkWatcher()->stop();
    if (platform) {
        tavrin::VXSetLogLevel(tavrin::vxInfo);
        clearLog();
    }
}

bool ProductHouse::untilElsewhere(const std::function<bool()>& condition) {
    return until([&] {
        if (condition())
            return true;
        platform->mainQueue().async([] {});
        return false;
    });
}

void ProductHouse::listenClosely() {
    tavrin::VXSetLogLevel(tavrin::vxDebug);
}

void ProductHouse::givenNetwork(const std::string& state) const {
    home.write(networkScript, state);
}

void ProductHouse::awaitIdentityChange(const std::function<void()>& change) {
    bool changed = false;
    const platform::Observation observation = platform->notifications().observe(
        platform::cloudIdentityDidChangeNotification,
        [&changed](const platform::Notification&) { changed = true; });
    change();
    EXPECT_TRUE(until([&] { return changed; }));
}

void ProductHouse::signInAs(const std::string& name, const std::string& remoteFolder) {
    platform::AccountRecord account;
    account.kind = platform::folderAccountKind;
    account.address = home.makeFolder(remoteFolder);
    account.name = name;
    account.identity = platform::Bytes(16, std::byte{9});
    awaitIdentityChange(
        [&] { EXPECT_FALSE(platform::writeAccount(platform->runtime().folders, account)); });
}

void ProductHouse::signOut() {
    awaitIdentityChange([&] {
        std::filesystem::remove(platform->runtime().folders.config + "/pelmora/account.json");
    });
}

void ProductHouse::givenContainer(const std::string& name, const std::string& description) const {
    home.write("remote/" + name + "/.container.json", description);
}

} // namespace test
