#include "platform/cloud/SignIn.h"

#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/cloud/AccountBook.h"
#include "platform/cloud/NameFolding.h"
#include "platform/cloud/Tokens.h"
#include "platform/cloud/webdav/WebDavAccount.h"
#include "platform/files/FileManager.h"

#include <filesystem>

namespace platform {
namespace {

constexpr std::size_t identityBytes = 16;

SignInAnswer refusal(SignInProblem problem, std::string words) {
    return {problem, makeErrorWithText(ErrorCode::invalidArgument, std::move(words)), {}, {}};
}

/// Why a folder cannot be the remote of an account; none when it can.
std::optional<std::string> folderProblem(const std::string& folder, const Folders& folders) {
    bool directory = false;
    if (!FileManager::exists(folder, &directory) || !directory)
        return localizedFormat("“%1$@” is not a folder. Make it first, or connect its disk.",
                               folder);
    if (!isUtf8(folder))
        return localized("The name of that folder is not UTF-8 text. Choose another folder.");
    std::error_code ignored;
    const std::string stores =
        std::filesystem::weakly_canonical(folders.data + "/pelmora", ignored).string();
    if (Url::file(stores).isInside(Url::file(folder)))
        return localizedFormat("“%1$@” holds the stores of accounts themselves. Choose another "
                               "folder.",
                               folder);
    for (Url up = Url::file(folder); up.path().size() > stores.size();
         up = *up.deletingLastPathComponent())
        if (FileManager::exists(up.path() + "/state.db"))
            return localizedFormat("“%1$@” lies in the store of an account. Choose another folder.",
                                   folder);
    return std::nullopt;
}

std::string wholePath(std::string path, const Folders& folders) {
    if (path == "~" || path.starts_with("~/"))
        path.replace(0, 1, folders.home);
    std::error_code ignored;
    const std::string whole = std::filesystem::weakly_canonical(path, ignored).string();
    return whole.size() > 1 && whole.ends_with('/') ? whole.substr(0, whole.size() - 1) : whole;
}

std::string withoutBlanks(std::string_view text) {
    constexpr std::string_view blanks = " \t\r\n";
    const std::size_t begin = text.find_first_not_of(blanks);
    if (begin == std::string_view::npos)
        return {};
    return std::string(text.substr(begin, text.find_last_not_of(blanks) + 1 - begin));
}

/// What people leave out of an address.
std::string wholeAddress(std::string_view typed) {
    const std::string address = withoutBlanks(typed);
    return address.empty() || address.find("://") != std::string::npos ? address
                                                                       : "https://" + address;
}

SignInProblem problemFor(WebDavProblem problem) {
    switch (problem) {
    case WebDavProblem::none:
        return SignInProblem::none;
    case WebDavProblem::address:
        return SignInProblem::address;
    case WebDavProblem::unreachable:
        return SignInProblem::unreachable;
    case WebDavProblem::certificate:
        return SignInProblem::certificate;
    case WebDavProblem::password:
        return SignInProblem::password;
    case WebDavProblem::notFound:
        return SignInProblem::notFound;
    case WebDavProblem::notWebDav:
        return SignInProblem::notWebDav;
    case WebDavProblem::other:
        break;
    }
    return SignInProblem::other;
}

AccountRecord accountFor(const SignInRequest& request, std::string address) {
    AccountRecord account;
    account.kind = request.kind;
    account.address = std::move(address);
    account.user = request.kind == webDavAccountKind ? withoutBlanks(request.user) : std::string();
    account.authorities = request.authorities;
    account.rateLimit = request.rateLimit;
    account.quota = request.quota;
    account.name = request.name.empty() ? nameForPeople(account) : request.name;
    account.identity = randomBytes(identityBytes);
    return account;
}

SignInAnswer checkFolder(const SignInRequest& request, const Folders& folders) {
    const std::string path = wholePath(withoutBlanks(request.address), folders);
    if (path.empty())
        return refusal(SignInProblem::address, localized("Give the folder of the account."));
    if (const std::optional<std::string> problem = folderProblem(path, folders))
        return refusal(SignInProblem::notFound, *problem);
    return {SignInProblem::none, {}, accountFor(request, path), {}};
}

SignInAnswer checkServer(const SignInRequest& request, const Folders& folders, Clock& clock,
                         CancelFlag& cancel) {
    const std::string address = wholeAddress(request.address);
    if (address.empty())
        return refusal(SignInProblem::address, localized("Give the address of the server."));
    std::string authorities;
    if (!request.authorities.empty()) {
        authorities = wholePath(request.authorities, folders);
        bool directory = false;
        if (!FileManager::exists(authorities, &directory) || directory)
            return refusal(SignInProblem::certificate,
                           localizedFormat("There is no file of certificates at “%1$@”.",
                                           authorities));
    }
    const WebDavAnswer answer =
        probeWebDav(address, {withoutBlanks(request.user), request.password}, authorities, clock, cancel);
    if (cancel.isCancelled())
        return {SignInProblem::cancelled, makeError(ErrorCode::userCancelled), {}, {}};
    if (answer.problem != WebDavProblem::none)
        return {problemFor(answer.problem), answer.failure, {}, {}};
    SignInRequest whole = request;
    whole.authorities = authorities;
    SignInAnswer good{SignInProblem::none, {}, accountFor(whole, answer.address), {}};
    if (!answer.capabilities.writable)
        good.remark = localized("The server lets you read here, and change nothing.");
    return good;
}

} // namespace

std::string nameForPeople(const AccountRecord& account) {
    if (account.kind != webDavAccountKind)
        return std::string(Url::file(account.address).lastPathComponent());
    const std::size_t begin = account.address.find("://");
    std::string host = account.address.substr(begin == std::string::npos ? 0 : begin + 3);
    host.resize(std::min(host.find('/'), host.size()));
    return account.user.empty() ? host : account.user + '@' + host;
}

bool sendsInTheClear(const SignInRequest& request) {
    if (request.kind != webDavAccountKind)
        return false;
    const std::string address = wholeAddress(request.address);
    if (!address.starts_with("http://"))
        return false;
    const std::string rest = address.substr(std::string_view("http://").size());
    for (const std::string_view own : {"localhost", "127.0.0.1", "[::1]"})
        if (rest.starts_with(own) &&
            (rest.size() == own.size() || rest[own.size()] == '/' || rest[own.size()] == ':'))
            return false; // it does not leave this machine
    return true;
}

SignInAnswer checkSignIn(const SignInRequest& request, const Folders& folders, Clock& clock,
                         CancelFlag& cancel) {
    return request.kind == webDavAccountKind ? checkServer(request, folders, clock, cancel)
                                             : checkFolder(request, folders);
}

Failure finishSignIn(const AccountRecord& account, const std::string& password, SecretPlace place,
                     SecretStore& secrets, const Folders& folders) {
    const bool hasSecret = account.kind == webDavAccountKind && !account.user.empty();
    const std::optional<AccountRecord> former = storedAccountLike(folders, account);
    if (hasSecret)
        if (Failure failure = secrets.store(secretNameOf(account), secretLabelOf(account), password,
                                            place))
            return failure;
    Failure failure = rememberAccount(folders, account);
    const std::optional<std::string> over =
        failure ? std::optional(secretNameOf(account))
                : (former ? std::optional(secretNameOf(*former)) : std::nullopt);
    if (over && hasSecret)
        if (const Failure left = secrets.remove(*over))
            platformLog(LogLevel::warning, "secrets: a former password cannot be removed: %@",
                        *left);
    return failure;
}

Failure signOutOf(const AccountRecord& account, SecretStore& secrets, const Folders& folders) {
    if (Failure failure = forgetAccount(folders, account.identity))
        return failure;
    if (account.kind != webDavAccountKind || account.user.empty())
        return std::nullopt;
    return secrets.remove(secretNameOf(account));
}

} // namespace platform
