#include "platform/base/Text.h"
#include "platform/cloud/AccountBook.h"
#include "platform/cloud/SignIn.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/cloud/StoreTakingAway.h"
#include "tools/pelmora/Command.h"
#include "tools/pelmora/Password.h"

#include <charconv>
#include <cstdio>
#include <limits>

namespace pelmora {
namespace {

using namespace platform;

/// Unsent documents that are named before the rest is counted.
constexpr std::size_t namedAtMost = 20;

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

struct SignInOptions {
    SignInRequest request;
    bool keepInFile = false;
};

std::string* textOption(SignInRequest& request, const std::string& option) {
    const bool server = request.kind == webDavAccountKind;
    if (option == "--name")
        return &request.name;
    if (option == "--user" && server)
        return &request.user;
    if (option == "--ca" && server)
        return &request.authorities;
    return nullptr;
}

/// Reads the options behind the place; answers a fault.
std::optional<std::string> readOptions(const std::vector<std::string>& arguments,
                                       SignInOptions& options) {
    SignInRequest& request = options.request;
    for (std::size_t i = 2; i < arguments.size(); ++i) {
        const std::string& option = arguments[i];
        if (option == "--keep-in-file" && request.kind == webDavAccountKind) {
            options.keepInFile = true;
            continue;
        }
        std::string* const text = textOption(request, option);
        const bool number = option == "--rate-limit" || option == "--quota";
        if (!text && !number)
            return "unknown option “" + option + "”";
        if (++i == arguments.size())
            return "“" + option + "” wants a value";
        if (text) {
            *text = arguments[i];
            continue;
        }
        const std::optional<std::uint64_t> bytes = byteCountOf(arguments[i]);
        if (!bytes)
            return "“" + arguments[i] + "” is no number of bytes";
        (option == "--quota" ? request.quota : request.rateLimit) = bytes;
    }
    if (request.kind == webDavAccountKind && request.user.empty())
        return "sign-in webdav wants --user NAME";
    return std::nullopt;
}

int complainAbout(const Failure& failure, const char* otherwise) {
    complain(failure->localizedDescription.value_or(otherwise));
    return failed;
}

/// Where the password goes; none when its user wants it nowhere.
std::optional<SecretPlace> placeFor(SecretStore& secrets, const Folders& folders,
                                    bool keepInFile) {
    if (keepInFile)
        return SecretPlace::file;
    if (secrets.hasKeyring())
        return SecretPlace::keyring;
    if (agrees("There is no keyring. Keep the password in " + secretFile(folders) +
               ", readable by you alone and not encrypted? [y/N] "))
        return SecretPlace::file;
    complain("there is no keyring for the password; with --keep-in-file it is kept in " +
             secretFile(folders) + ", readable by you alone and not encrypted");
    return std::nullopt;
}

int signInWith(SignInOptions options) {
    const Folders folders = Folders::fromProcessEnvironment();
    const std::unique_ptr<Clock> clock = makeRealClock();
    const std::unique_ptr<SecretStore> secrets = makeSecretStore(folders);
    SignInRequest& request = options.request;
    std::optional<SecretPlace> place = SecretPlace::file;
    if (request.kind == webDavAccountKind) {
        if (sendsInTheClear(request))
            complain("warning: the way to that server is not encrypted; everybody on it can read "
                     "the password. Use https:// where the server has it");
        Result<std::string> password = readPassword("Password of " + request.user + ": ");
        if (!password) {
            complain("no password was given");
            return interrupted;
        }
        request.password = std::move(*password);
    }
    CancelFlag never;
    const SignInAnswer answer = checkSignIn(request, folders, *clock, never);
    if (answer.problem != SignInProblem::none)
        return complainAbout(answer.failure, "signing in is not possible there");
    if (request.kind == webDavAccountKind)
        place = placeFor(*secrets, folders, options.keepInFile);
    if (!place)
        return failed;
    if (const Failure failure =
            finishSignIn(answer.account, request.password, *place, *secrets, folders))
        return complainAbout(failure, "the account file cannot be written");
    if (answer.remark)
        std::printf("%s\n", answer.remark->c_str());
    const std::optional<AccountRecord> stored = readAccount(folders).account;
    std::printf("Signed in to “%s” (%s).\n", stored ? stored->name.c_str() : "",
                answer.account.address.c_str());
    return done;
}

/// The account of that name, or the active one without a name. Complains when there is none.
std::optional<AccountRecord> chosenAccount(const Folders& folders, const std::string* name) {
    const std::optional<AccountRecord> account =
        name ? accountNamed(folders, *name) : readAccount(folders).account;
    if (!account && name)
        complain("there is no account “" + *name + "”, or more than one; see \"pelmora accounts\"");
    else if (!account)
        complain("nobody is signed in");
    return account;
}

void nameDocuments(const std::vector<std::string>& documents) {
    for (std::size_t i = 0; i < documents.size() && i < namedAtMost; ++i)
        std::fprintf(stderr, "  %s\n", documents[i].c_str());
    if (documents.size() > namedAtMost)
        std::fprintf(stderr, "  and %zu more\n", documents.size() - namedAtMost);
}

/// None when everything is on the account, or an exit code after saying what is not.
std::optional<int> refuseUnsent(const StoreLayout& layout) {
    CancelFlag never;
    const Result<std::vector<std::string>> unsent =
        unsentDocuments(layout, *makeRealStoreFileSystem(), never);
    if (!unsent)
        return complainAbout(unsent.error(), "the store cannot be read");
    if (unsent->empty())
        return std::nullopt;
    complain("these are on this device alone; bring them to the account with \"pelmora sync\", or "
             "sign out without --remove-files:");
    nameDocuments(*unsent);
    return failed;
}

int removeFiles(const StoreLayout& layout, Clock& clock) {
    CancelFlag never;
    const Result<std::vector<std::string>> left =
        takeStoreAway(layout, *makeRealStoreFileSystem(), clock, never);
    if (!left) {
        complainAbout(left.error(), "the files cannot be removed");
        return left.error().is(ErrorCode::itemBusy) ? storeInUse : failed;
    }
    if (left->empty()) {
        std::printf("Signed out. The documents on this device are removed.\n");
        return done;
    }
    complain("signed out; these changed meanwhile and stay in " + layout.root() + ":");
    nameDocuments(*left);
    return failed;
}

/// The command before the account is forgotten: a store in use is left alone altogether.
std::optional<int> refuseInUse(const StoreLayout& layout) {
    if (!FileManager::exists(layout.folder))
        return std::nullopt;
    const Result<StoreLock> lock = StoreLock::acquire(layout);
    if (lock)
        return std::nullopt;
    complainAbout(lock.error(), "the store is in use");
    return lock.error().is(ErrorCode::itemBusy) ? storeInUse : failed;
}

} // namespace

int signIn(const std::vector<std::string>& arguments) {
    if (arguments.size() < 2)
        return usageFault("sign-in", "sign-in wants a kind and a place");
    if (arguments[0] != folderAccountKind && arguments[0] != webDavAccountKind)
        return usageFault("sign-in", "“" + arguments[0] + "” is no kind of account");
    SignInOptions options;
    options.request.kind = arguments[0];
    options.request.address = arguments[1];
    if (const std::optional<std::string> fault = readOptions(arguments, options))
        return usageFault("sign-in", *fault);
    return signInWith(std::move(options));
}

int listAccounts(const std::vector<std::string>& arguments) {
    if (!arguments.empty())
        return usageFault("accounts", "accounts takes no arguments");
    const Folders folders = Folders::fromProcessEnvironment();
    const std::optional<AccountRecord> active = readAccount(folders).account;
    for (const AccountRecord& account : storedAccounts(folders))
        std::printf("%c %s (%s)\n", active && active->identity == account.identity ? '*' : ' ',
                    account.name.c_str(), account.address.c_str());
    return done;
}

int useStoredAccount(const std::vector<std::string>& arguments) {
    if (arguments.size() != 1)
        return usageFault("use", "use wants the name of an account");
    const Folders folders = Folders::fromProcessEnvironment();
    const std::optional<AccountRecord> account = chosenAccount(folders, &arguments.front());
    if (!account)
        return noAccount;
    if (const Failure failure = useAccount(folders, account->identity))
        return complainAbout(failure, "the account file cannot be written");
    std::printf("“%s” is the active account.\n", account->name.c_str());
    return done;
}

int signOut(const std::vector<std::string>& arguments) {
    const std::string* name = nullptr;
    bool remove = false;
    for (const std::string& argument : arguments)
        if (argument == "--remove-files")
            remove = true;
        else if (!name && !argument.starts_with("--"))
            name = &argument;
        else
            return usageFault("sign-out", "“" + argument + "” is too much");
    const Folders folders = Folders::fromProcessEnvironment();
    const std::optional<AccountRecord> account = chosenAccount(folders, name);
    // A file that names nobody may be removed by its owner.
    if (!account && (name || remove || readAccount(folders).missing))
        return noAccount;
    if (!account) {
        const Failure failure = removeAccount(folders);
        return failure ? complainAbout(failure, "the account file cannot be removed") : done;
    }
    const StoreLayout layout = StoreLayout::of(folders, *account);
    if (remove) {
        if (const std::optional<int> refused = refuseInUse(layout))
            return *refused;
        if (const std::optional<int> refused = refuseUnsent(layout))
            return *refused;
    }
    if (const Failure failure = signOutOf(*account, *makeSecretStore(folders), folders))
        return complainAbout(failure, "the account cannot be forgotten");
    if (remove)
        return removeFiles(layout, *makeRealClock());
    std::printf("Signed out. The documents on this device stay where they are.\n");
    return done;
}

} // namespace pelmora
