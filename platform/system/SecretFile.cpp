#include "platform/system/SecretFile.h"

#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/files/FileManager.h"

#include <nlohmann/json.hpp>

#include <cerrno>
#include <sys/stat.h>

namespace platform {
namespace {

using Secrets = nlohmann::json;

constexpr std::uint64_t largestSecretFile = 1024 * 1024;
constexpr std::uint32_t ownerAlone = 0600;
constexpr std::uint32_t everybodyElse = 0077;

Error damagedFile(const std::string& path) {
    return makeErrorWithText(ErrorCode::readCorrupt,
                             localizedFormat("The file of passwords “%1$@” is damaged. Move it "
                                             "away and sign in again.",
                                             path));
}

Failure closeToOthers(const std::string& path) {
    const Result<FileAttributes> attributes = FileManager::attributes(path, FollowLinks::no);
    if (!attributes)
        return attributes.error();
    if ((attributes->mode & everybodyElse) == 0)
        return std::nullopt;
    if (::chmod(path.c_str(), ownerAlone) != 0)
        return posixError(errno, Url::file(path), true);
    platformLog(LogLevel::warning, "secrets: “%@” could be read by others, and no longer can",
                path);
    return std::nullopt;
}

/// An empty object where there is no file.
Result<Secrets> readSecrets(const std::string& path) {
    Failure failure = closeToOthers(path);
    const Result<Bytes> content = failure
                                      ? Result<Bytes>(*failure)
                                      : FileManager::contents(Url::file(path), largestSecretFile);
    if (!content && content.error().is(ErrorCode::noSuchItem))
        return Secrets::object();
    if (!content)
        return content.error();
    const auto* const text = reinterpret_cast<const char*>(content->data());
    Secrets secrets = Secrets::parse(text, text + content->size(), nullptr, false);
    if (!secrets.is_object())
        return damagedFile(path);
    return secrets;
}

Failure writeSecrets(const std::string& path, const Secrets& secrets) {
    const Url file = Url::file(path);
    if (secrets.empty()) {
        Failure failure = FileManager::removeItem(file);
        return failure && !failure->is(ErrorCode::noSuchItem) ? failure : std::nullopt;
    }
    if (Failure failure = FileManager::createDirectory(*file.deletingLastPathComponent(), true))
        return failure;
    return FileManager::writeAtomically(file, secrets.dump(4) + '\n', ownerAlone);
}

/// Passwords are text of any coding, JSON is UTF-8: a byte is a character of the same number.
std::string widened(const std::string& secret) {
    std::string text;
    for (const char c : secret) {
        const auto byte = static_cast<unsigned char>(c);
        if (byte < 0x80) {
            text += c;
        } else {
            text += static_cast<char>(0xC0 | (byte >> 6));
            text += static_cast<char>(0x80 | (byte & 0x3F));
        }
    }
    return text;
}

std::string narrowed(const std::string& text) {
    std::string secret;
    for (std::size_t i = 0; i < text.size(); ++i) {
        const auto byte = static_cast<unsigned char>(text[i]);
        if (byte < 0x80 || i + 1 == text.size())
            secret += text[i];
        else
            secret += static_cast<char>(((byte & 0x03) << 6) | (text[++i] & 0x3F));
    }
    return secret;
}

} // namespace

Result<std::optional<std::string>> SecretFile::lookUp(const std::string& account) {
    const std::lock_guard lock(mutex_);
    const Result<Secrets> secrets = readSecrets(path_);
    if (!secrets)
        return secrets.error();
    const auto found = secrets->find(account);
    if (found == secrets->end() || !found->is_string())
        return std::optional<std::string>();
    return std::optional(narrowed(found->get<std::string>()));
}

Failure SecretFile::store(const std::string& account, const std::string& secret) {
    const std::lock_guard lock(mutex_);
    Result<Secrets> secrets = readSecrets(path_);
    if (!secrets)
        return secrets.error();
    (*secrets)[account] = widened(secret);
    return writeSecrets(path_, *secrets);
}

Failure SecretFile::remove(const std::string& account) {
    const std::lock_guard lock(mutex_);
    Result<Secrets> secrets = readSecrets(path_);
    if (!secrets)
        return secrets.error();
    if (secrets->erase(account) == 0)
        return std::nullopt;
    return writeSecrets(path_, *secrets);
}

} // namespace platform
