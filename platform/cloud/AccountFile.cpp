#include "platform/cloud/AccountFile.h"

#include "platform/base/Text.h"
#include "platform/cloud/ContentHash.h"
#include "platform/cloud/Tokens.h"
#include "platform/cloud/webdav/WebDavAddress.h"
#include "platform/files/FileManager.h"

#include <nlohmann/json.hpp>

#include <algorithm>

namespace platform {
namespace {

using Json = nlohmann::json;

constexpr std::uint64_t largestAccountFile = 64 * 1024;
constexpr std::size_t shortestIdentity = 8;

AccountReading refused(std::string problem) {
    return {std::nullopt, std::move(problem), false};
}

std::string textOf(const Json& object, const char* key) {
    const auto found = object.find(key);
    return found != object.end() && found->is_string() ? found->get<std::string>() : std::string();
}

std::optional<std::uint64_t> countOf(const Json& object, const char* key) {
    const auto found = object.find(key);
    if (found == object.end() || !found->is_number_unsigned())
        return std::nullopt;
    return found->get<std::uint64_t>();
}

AccountReading accountFrom(const Json& object, const std::string& file) {
    AccountRecord account;
    account.kind = textOf(object, "kind");
    account.address = textOf(object, "address");
    account.name = textOf(object, "name");
    account.user = textOf(object, "user");
    account.authorities = textOf(object, "authorities");
    account.rateLimit = countOf(object, "rateLimit");
    account.quota = countOf(object, "quota");
    if (account.kind != folderAccountKind && account.kind != webDavAccountKind)
        return refused(localizedFormat("The account is of the kind “%1$@”, which this version does "
                                       "not know. Update the program or sign in again.",
                                       account.kind));
    if (account.kind == folderAccountKind && !account.address.starts_with('/'))
        return refused(localizedFormat("The account's folder “%1$@” is not an absolute path. Sign "
                                       "in again with the whole path.",
                                       account.address));
    if (account.kind == webDavAccountKind)
        if (const Result<WebDavAddress> server = WebDavAddress::parse(account.address); !server)
            return refused(server.error().localizedDescription.value_or(account.address));
    const std::optional<Bytes> identity = bytesOfHex(textOf(object, "identity"));
    if (!identity || identity->size() < shortestIdentity)
        return refused(localizedFormat("The account file “%1$@” does not say who is signed in. "
                                       "Sign in again.",
                                       file));
    account.identity = *identity;
    return {std::move(account), std::nullopt, false};
}

/// Letters and digits of ASCII, everything else as "-".
std::string plainWord(std::string_view text) {
    std::string word(text.substr(0, 40));
    std::transform(word.begin(), word.end(), word.begin(), [](char c) {
        const bool keep =
            (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9');
        return keep ? c : '-';
    });
    return word;
}

} // namespace

std::string accountFolder(const Folders& folders) {
    return folders.config + "/pelmora";
}

std::string accountFile(const Folders& folders) {
    return accountFolder(folders) + "/account.json";
}

std::string nobodySignedInText() {
    return localized("No Pelmora account is signed in. Sign in with the command “pelmora "
                     "sign-in”.");
}

AccountReading readAccount(const Folders& folders) {
    const std::string file = accountFile(folders);
    const Result<Bytes> content = FileManager::contents(Url::file(file), largestAccountFile);
    if (!content && content.error().is(ErrorCode::noSuchItem))
        return {std::nullopt, nobodySignedInText(), true};
    if (!content)
        return refused(localizedFormat("The account file “%1$@” cannot be read. Check its "
                                       "permissions.",
                                       file));
    return accountOfText({reinterpret_cast<const char*>(content->data()), content->size()}, file);
}

AccountReading accountOfText(std::string_view text, const std::string& file) {
    const Json object = Json::parse(text.begin(), text.end(), nullptr, false);
    if (!object.is_object())
        return refused(localizedFormat("The account file “%1$@” is damaged. Sign in again.", file));
    return accountFrom(object, file);
}

std::string textOfAccount(const AccountRecord& account) {
    Json object;
    object["kind"] = account.kind;
    object["address"] = account.address;
    object["name"] = account.name;
    if (!account.user.empty())
        object["user"] = account.user;
    if (!account.authorities.empty())
        object["authorities"] = account.authorities;
    object["identity"] = hexText(account.identity);
    if (account.rateLimit)
        object["rateLimit"] = *account.rateLimit;
    if (account.quota)
        object["quota"] = *account.quota;
    return object.dump(4, ' ', false, Json::error_handler_t::replace) + '\n';
}

Failure writeAccount(const Folders& folders, const AccountRecord& account) {
    if (Failure failure = FileManager::createDirectory(Url::file(accountFolder(folders)), true))
        return failure;
    return FileManager::writeAtomically(Url::file(accountFile(folders)), textOfAccount(account),
                                        0600);
}

Failure removeAccount(const Folders& folders) {
    Failure failure = FileManager::removeItem(Url::file(accountFile(folders)));
    if (failure && failure->is(ErrorCode::noSuchItem))
        return std::nullopt;
    return failure;
}

std::string storeFolderName(const AccountRecord& account) {
    // Two who share a server share nothing of what is here.
    const std::string who = account.user.empty() ? std::string() : '\n' + account.user;
    Bytes hash = ContentHash::of(account.kind + '\n' + account.address + who);
    hash.resize(6);
    const std::size_t slash = account.address.find_last_of('/');
    const std::string_view last =
        std::string_view(account.address).substr(slash == std::string::npos ? 0 : slash + 1);
    return account.kind + '-' + plainWord(last) + '-' + hexText(hash);
}

} // namespace platform
