#include "tests/product/ProductHouse.h"

#include "app/VXLogging.h"
#include "platform/base/Process.h"
#include "platform/cloud/AccountFile.h"
#include "platform/cloud/CloudAccountService.h"
#include "platform/system/ReachabilityService.h"
#include "platform/system/SecretFile.h"
#include "platform/system/SecretStore.h"
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

/// The file alone: the keyring of whoever runs the tests is none of their business.
class SecretsWithoutKeyring final : public platform::SecretStore {
public:
    explicit SecretsWithoutKeyring(std::string file) : file_(std::move(file)) {}
    bool hasKeyring() override { return false; }
    bool isInFile(const std::string& account) override {
        const auto kept = file_.lookUp(account);
        return kept && *kept;
    }
    platform::Result<std::optional<std::string>> lookUp(const std::string& account) override {
        return file_.lookUp(account);
    }
    platform::Failure store(const std::string& account, const std::string& /*label*/,
                            const std::string& secret, platform::SecretPlace place) override {
        if (place == platform::SecretPlace::keyring)
            return platform::makeError(platform::ErrorCode::unsupportedOperation);
        return file_.store(account, secret);
    }
    platform::Failure remove(const std::string& account) override { return file_.remove(account); }

private:
    platform::SecretFile file_;
};

} // namespace

ProductHouse::ProductHouse() {
    static const DeskWithoutApplications desk;
    home.write(networkScript, "wifi");
    adjustParts = [this](platform::PlatformParts& parts) {
        parts.jot = std::make_unique<CapturingJot>();
        parts.reachability = platform::makeScriptedReachability("file:" + (home / networkScript));
        parts.secrets =
            std::make_shared<SecretsWithoutKeyring>(home / "config/pelmora/secrets.json");
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
