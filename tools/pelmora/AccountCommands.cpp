#include "platform/base/Text.h"
#include "platform/cloud/AccountFile.h"
#include "platform/cloud/NameFolding.h"
#include "platform/cloud/Tokens.h"
#include "platform/files/FileManager.h"
#include "tools/pelmora/Command.h"

#include <charconv>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <limits>

namespace pelmora {
namespace {

using namespace platform;

constexpr std::size_t identityBytes = 16;

/// "250000", "250K", "2M", "1G": multiples of a thousand.
std::optional<std::uint64_t> byteCountOf(std::string_view text) {
    std::uint64_t number = 0;
    const auto [end, fault] = std::from_chars(text.data(), text.data() + text.size(), number);
    if (fault != std::errc{} || number == 0)
        return std::nullopt;
    const std::string_view suffix(end, static_cast<std::size_t>(text.data() + text.size() - end));
    std::uint64_t factor = 1;
    if (suffix == "K")
        factor = 1000;
    else if (suffix == "M")
        factor = 1'000'000;
    else if (suffix == "G")
        factor = 1'000'000'000;
    else if (!suffix.empty())
        return std::nullopt;
    if (number > std::numeric_limits<std::uint64_t>::max() / factor)
        return std::nullopt;
    return number * factor;
}

/// Why a folder cannot be the remote of an account; none when it can.
std::optional<std::string> folderProblem(const std::string& folder, const Folders& folders) {
    bool directory = false;
    if (!FileManager::exists(folder, &directory) || !directory)
        return "“" + folder + "” is not a folder; make it first, or connect its disk";
    if (!isUtf8(folder))
        return "the name of that folder is not UTF-8 text; choose another folder";
    std::error_code ignored;
    const std::string stores =
        std::filesystem::weakly_canonical(folders.data + "/pelmora", ignored).string();
    if (Url::file(stores).isInside(Url::file(folder)))
        return "“" + folder + "” holds the stores themselves; choose another folder";
    for (Url up = Url::file(folder); up.path().size() > stores.size();
         up = *up.deletingLastPathComponent())
        if (FileManager::exists(up.path() + "/state.db"))
            return "“" + folder + "” lies in the store of an account; choose another folder";
    return std::nullopt;
}

/// Reads the options behind the path into the record.
std::optional<std::string> readOptions(const std::vector<std::string>& arguments,
                                       AccountRecord& account) {
    for (std::size_t i = 2; i < arguments.size(); i += 2) {
        const std::string& option = arguments[i];
        if (option != "--name" && option != "--rate-limit" && option != "--quota")
            return "unknown option “" + option + "”";
        if (i + 1 == arguments.size())
            return "“" + option + "” wants a value";
        const std::string& value = arguments[i + 1];
        if (option == "--name") {
            account.name = value;
            continue;
        }
        const std::optional<std::uint64_t> bytes = byteCountOf(value);
        if (!bytes)
            return "“" + value + "” is no number of bytes";
        (option == "--quota" ? account.quota : account.rateLimit) = bytes;
    }
    return std::nullopt;
}

} // namespace

int signIn(const std::vector<std::string>& arguments) {
    if (arguments.size() < 2)
        return usageFault("sign-in", "sign-in wants a kind and a place");
    if (arguments[0] != folderAccountKind)
        return usageFault("sign-in", "“" + arguments[0] + "” is no kind of account");
    AccountRecord account;
    account.kind = arguments[0];
    if (const std::optional<std::string> fault = readOptions(arguments, account))
        return usageFault("sign-in", *fault);
    const Folders folders = Folders::fromProcessEnvironment();
    std::error_code ignored;
    account.address = std::filesystem::weakly_canonical(arguments[1], ignored).string();
    if (const std::optional<std::string> problem = folderProblem(account.address, folders)) {
        complain(*problem);
        return failed;
    }
    if (account.name.empty())
        account.name = Url::file(account.address).lastPathComponent();
    account.identity = randomBytes(identityBytes);
    if (const Failure failure = writeAccount(folders, account)) {
        complain(failure->localizedDescription.value_or("the account file cannot be written"));
        return failed;
    }
    std::printf("Signed in to “%s” (%s).\n", account.name.c_str(), account.address.c_str());
    return done;
}

int signOut(const std::vector<std::string>& arguments) {
    if (!arguments.empty())
        return usageFault("sign-out", "sign-out takes no arguments");
    const Folders folders = Folders::fromProcessEnvironment();
    if (readAccount(folders).missing) {
        complain("nobody is signed in");
        return noAccount;
    }
    if (const Failure failure = removeAccount(folders)) {
        complain(failure->localizedDescription.value_or("the account file cannot be removed"));
        return failed;
    }
    std::printf("Signed out. The documents on this device stay where they are.\n");
    return done;
}

} // namespace pelmora
