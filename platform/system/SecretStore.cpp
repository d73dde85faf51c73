#include "platform/system/SecretStore.h"

#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/system/Keyring.h"
#include "platform/system/SecretFile.h"

namespace platform {
namespace {

/// The file is asked first: a secret is in it only because the user chose so, and nobody has to
/// open a keyring for it.
class DeskSecrets final : public SecretStore {
public:
    explicit DeskSecrets(std::string file) : file_(std::move(file)) {}

    bool hasKeyring() override { return keyringIsThere(); }

    bool isInFile(const std::string& account) override {
        const Result<std::optional<std::string>> kept = file_.lookUp(account);
        return kept && *kept;
    }

    Result<std::optional<std::string>> lookUp(const std::string& account) override {
        Result<std::optional<std::string>> kept = file_.lookUp(account);
        if (kept && *kept)
            return kept;
        if (!hasKeyring())
            return kept;
        Result<std::optional<std::string>> found = lookUpInKeyring(account);
        return found && !*found ? kept : found;
    }

    Failure store(const std::string& account, const std::string& label, const std::string& secret,
                  SecretPlace place) override {
        if (place == SecretPlace::file) {
            Failure failure = file_.store(account, secret);
            if (!failure && hasKeyring())
                logFailure(removeFromKeyring(account));
            return failure;
        }
        if (!hasKeyring())
            return makeErrorWithText(ErrorCode::unsupportedOperation,
                                     localized("There is no keyring on this desk that could keep "
                                               "the password."));
        Failure failure = storeInKeyring(account, label, secret);
        return failure ? failure : file_.remove(account);
    }

    Failure remove(const std::string& account) override {
        Failure failure = file_.remove(account);
        if (!hasKeyring())
            return failure;
        Failure other = removeFromKeyring(account);
        return failure ? failure : other;
    }

private:
    static void logFailure(const Failure& failure) {
        if (failure)
            platformLog(LogLevel::warning, "secrets: the keyring keeps a former password: %@",
                        *failure);
    }

    SecretFile file_;
};

} // namespace

std::unique_ptr<SecretStore> makeSecretStore(const Folders& folders) {
    return std::make_unique<DeskSecrets>(secretFile(folders));
}

std::string secretFile(const Folders& folders) {
    return folders.config + "/pelmora/secrets.json";
}

} // namespace platform
