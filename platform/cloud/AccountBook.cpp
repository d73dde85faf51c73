#include "platform/cloud/AccountBook.h"

#include "platform/base/Identity.h"
#include "platform/base/Log.h"
#include "platform/cloud/Tokens.h"
#include "platform/files/FileManager.h"

#include <nlohmann/json.hpp>

#include <algorithm>

namespace platform {
namespace {

using BookJson = nlohmann::json;

constexpr std::uint64_t largestBook = 4 * 1024 * 1024;
constexpr const char* accountsKey = "accounts";

bool isAtSamePlace(const AccountRecord& one, const AccountRecord& other) {
    return one.kind == other.kind && one.address == other.address && one.user == other.user;
}

/// The file's list. What a later version wrote stays as it is. `damaged` tells of a file that is
/// none.
BookJson readBook(const Folders& folders, bool& damaged) {
    const std::string file = accountsFile(folders);
    const Result<Bytes> content = FileManager::contents(Url::file(file), largestBook);
    damaged = !content && !content.error().is(ErrorCode::noSuchItem);
    if (!content)
        return BookJson::array();
    const auto* const text = reinterpret_cast<const char*>(content->data());
    BookJson book = BookJson::parse(text, text + content->size(), nullptr, false);
    const auto list = book.is_object() ? book.find(accountsKey) : book.end();
    damaged = !book.is_object() || list == book.end() || !list->is_array();
    if (damaged)
        platformLog(LogLevel::warning, "cloud: the list of accounts “%@” is damaged", file);
    return damaged ? BookJson::array() : *list;
}

Failure writeBook(const Folders& folders, const BookJson& list, bool damaged) {
    const std::string file = accountsFile(folders);
    if (damaged)
        if (Failure failure = FileManager::moveItem(
                Url::file(file), Url::file(file + ".damaged-" + hexText(randomBytes(4)))))
            return failure;
    if (Failure failure = FileManager::createDirectory(Url::file(accountFolder(folders)), true))
        return failure;
    const BookJson book{{accountsKey, list}};
    return FileManager::writeAtomically(
        Url::file(file), book.dump(4, ' ', false, BookJson::error_handler_t::replace) + '\n', 0600);
}

/// Also what account.json alone has.
std::vector<AccountRecord> accountsIn(const BookJson& list, const Folders& folders) {
    std::vector<AccountRecord> accounts;
    for (const BookJson& entry : list)
        if (const AccountReading reading = accountOfText(entry.dump(), accountsFile(folders));
            reading.account)
            accounts.push_back(*reading.account);
    const std::optional<AccountRecord> active = readAccount(folders).account;
    if (!active)
        return accounts;
    const auto same = std::find_if(accounts.begin(), accounts.end(), [&](const auto& each) {
        return isAtSamePlace(each, *active);
    });
    if (same == accounts.end())
        accounts.push_back(*active);
    else
        *same = *active; // whoever wrote that file knew better
    return accounts;
}

BookJson listOf(const std::vector<AccountRecord>& accounts, const BookJson& before) {
    BookJson list = BookJson::array();
    for (const BookJson& entry : before)
        if (!accountOfText(entry.dump(), "").account)
            list.push_back(entry);
    for (const AccountRecord& account : accounts)
        list.push_back(BookJson::parse(textOfAccount(account)));
    return list;
}

std::string freeName(const std::vector<AccountRecord>& accounts, const AccountRecord& account) {
    std::string name = account.name;
    const auto isTaken = [&](const AccountRecord& each) {
        return each.name == name && !isAtSamePlace(each, account);
    };
    for (int number = 2; std::any_of(accounts.begin(), accounts.end(), isTaken); ++number)
        name = account.name + ' ' + std::to_string(number);
    return name;
}

} // namespace

std::string accountsFile(const Folders& folders) {
    return accountFolder(folders) + "/accounts.json";
}

std::string secretNameOf(const AccountRecord& account) {
    return hexText(account.identity);
}

std::string secretLabelOf(const AccountRecord& account) {
    return std::string(applicationName) + ": " + account.name;
}

std::vector<AccountRecord> storedAccounts(const Folders& folders) {
    bool damaged = false;
    return accountsIn(readBook(folders, damaged), folders);
}

std::optional<AccountRecord> accountNamed(const Folders& folders, std::string_view name) {
    std::optional<AccountRecord> found;
    for (AccountRecord& account : storedAccounts(folders)) {
        if (account.name != name && account.address != name)
            continue;
        if (found)
            return std::nullopt;
        found = std::move(account);
    }
    return found;
}

std::optional<AccountRecord> storedAccountLike(const Folders& folders,
                                               const AccountRecord& account) {
    for (AccountRecord& each : storedAccounts(folders))
        if (isAtSamePlace(each, account))
            return std::move(each);
    return std::nullopt;
}

Failure rememberAccount(const Folders& folders, AccountRecord account) {
    bool damaged = false;
    const BookJson before = readBook(folders, damaged);
    std::vector<AccountRecord> accounts = accountsIn(before, folders);
    account.name = freeName(accounts, account);
    const auto same = std::find_if(accounts.begin(), accounts.end(), [&](const auto& each) {
        return isAtSamePlace(each, account);
    });
    if (same == accounts.end())
        accounts.push_back(account);
    else
        *same = account;
    if (Failure failure = writeBook(folders, listOf(accounts, before), damaged))
        return failure;
    return writeAccount(folders, account);
}

Failure useAccount(const Folders& folders, const Bytes& identity) {
    bool damaged = false;
    const BookJson before = readBook(folders, damaged);
    const std::vector<AccountRecord> accounts = accountsIn(before, folders);
    const auto found = std::find_if(accounts.begin(), accounts.end(), [&](const auto& each) {
        return each.identity == identity;
    });
    if (found == accounts.end())
        return makeError(ErrorCode::noAccount);
    // The active one may stand in account.json alone, which is about to name another.
    if (Failure failure = writeBook(folders, listOf(accounts, before), damaged))
        return failure;
    return writeAccount(folders, *found);
}

Failure forgetAccount(const Folders& folders, const Bytes& identity) {
    bool damaged = false;
    const BookJson before = readBook(folders, damaged);
    std::vector<AccountRecord> accounts = accountsIn(before, folders);
    if (const std::optional<AccountRecord> active = readAccount(folders).account;
        active && active->identity == identity)
        if (Failure failure = removeAccount(folders))
            return failure;
    const std::size_t count = accounts.size();
    std::erase_if(accounts, [&](const auto& each) { return each.identity == identity; });
    return accounts.size() == count ? std::nullopt
                                    : writeBook(folders, listOf(accounts, before), damaged);
}

} // namespace platform
