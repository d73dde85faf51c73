#pragma once

#include "platform/base/Url.h"

#include <optional>
#include <string>
#include <string_view>

namespace platform {

/// The domain of errors that the system itself makes. Errors of the operating system are translated
/// into it (see posixError), so that code branches on one table.
inline constexpr std::string_view generalErrorDomain = "PelmoraGeneralErrorDomain";

/// Codes of generalErrorDomain.
enum class ErrorCode {
    noSuchItem = 4,
    invalidArgument = 22,
    readNoPermission = 257,
    readCorrupt = 259,
    unknownIo = 256,
    writeNoPermission = 513,
    invalidFilename = 514,
    fileExists = 516,
    nameTooLong = 517,
    folderNotEmpty = 518,
    outOfSpace = 640,
    readOnlyVolume = 642,
    userCancelled = 3072,
    unsupportedOperation = 3328,
    timedOut = 3584,
    itemBusy = 3585,
    changedWhileRead = 3586,
    notUploadedYet = 4353,
    noAccount = 4354,
    serverNotAvailable = 4355,
    authenticationFailed = 4356,
    serverRefused = 4357,
    quotaExceeded = 4358,
    databaseFromLaterVersion = 4359,
    databaseUnusable = 4360,
    /// The version on the server is not the one that the change was made for.
    changedRemotely = 4361,
    /// The server cannot hold an item of that name.
    nameRefused = 4362,
};

/// What went wrong: a domain and a code to branch on, and words for the user. A value.
struct Error {
    std::string domain;
    int code = 0;
    /// Names the cause and what to do; already in the user's language.
    std::optional<std::string> localizedDescription;
    std::optional<std::string> localizedFailureReason;

    bool is(ErrorCode which) const {
        return code == static_cast<int>(which) && domain == generalErrorDomain;
    }
    bool operator==(const Error& other) const {
        return code == other.code && domain == other.domain;
    }
};

/// An error of the general domain with its standard description, which names `subject` (usually a
/// file name) where there is one.
Error makeError(ErrorCode code, std::string_view subject = {});
/// An error of the general domain with a description of its own.
Error makeErrorWithText(ErrorCode code, std::string description);
/// Translates an errno of an operation on `url`; `writing` chooses between "read" and "write"
/// codes.
Error posixError(int number, const Url& url, bool writing);

/// "domain (code): description", for logs.
void appendDescription(std::string& out, const Error& error);

} // namespace platform
