#include "platform/base/Error.h"

#include "platform/base/Text.h"

#include <cerrno>
#include <cstring>

namespace platform {
namespace {

/// The standard words of a code: cause first, then what to do. "%1$@" is the item's name.
const char* textKey(ErrorCode code) {
    switch (code) {
    case ErrorCode::noSuchItem:
        return "“%1$@” is no longer there. It may have been moved or deleted.";
    case ErrorCode::invalidArgument:
        return "“%1$@” cannot be used here.";
    case ErrorCode::readNoPermission:
        return "You do not have permission to read “%1$@”.";
    case ErrorCode::readCorrupt:
        return "“%1$@” is damaged and cannot be read.";
    case ErrorCode::unknownIo:
        return "“%1$@” could not be read or written because of a disk error.";
    case ErrorCode::writeNoPermission:
        return "You do not have permission to change “%1$@”.";
    case ErrorCode::invalidFilename:
        return "The name “%1$@” cannot be used. Choose a different name.";
    case ErrorCode::fileExists:
        return "An item named “%1$@” already exists. Choose a different name.";
    case ErrorCode::nameTooLong:
        return "The name “%1$@” is too long. Choose a shorter one.";
    case ErrorCode::folderNotEmpty:
        return "The folder “%1$@” is not empty.";
    case ErrorCode::outOfSpace:
        return "There is not enough free space on the disk for “%1$@”. Free some space and try "
               "again.";
    case ErrorCode::readOnlyVolume:
        return "“%1$@” cannot be changed because its disk is read-only.";
    case ErrorCode::userCancelled:
        return "The operation was cancelled.";
    case ErrorCode::unsupportedOperation:
        return "A file cannot take the place of a folder, nor a folder that of a file.";
    case ErrorCode::timedOut:
        return "The operation on “%1$@” took too long. Try again.";
    case ErrorCode::itemBusy:
        return "“%1$@” is in use. Close it elsewhere and try again.";
    case ErrorCode::changedWhileRead:
        return "“%1$@” was changed while it was being read. Try again.";
    case ErrorCode::notUploadedYet:
        return "“%1$@” has not been uploaded yet, so its copy on this device is kept.";
    case ErrorCode::noAccount:
        return "No Pelmora account is signed in.";
    case ErrorCode::serverNotAvailable:
        return "The Pelmora server cannot be reached. Check the connection and try again.";
    case ErrorCode::authenticationFailed:
        return "The Pelmora server did not accept the user name or the password.";
    case ErrorCode::serverRefused:
        return "The Pelmora server refused the request for “%1$@”.";
    case ErrorCode::quotaExceeded:
        return "There is no space left in your Pelmora account. Delete something to make room.";
    case ErrorCode::databaseFromLaterVersion:
        return "The store was used by a later version of this program. Update the program to open "
               "it.";
    case ErrorCode::changedRemotely:
        return "“%1$@” was changed on another device. Both versions are kept.";
    case ErrorCode::nameRefused:
        return "The Pelmora server cannot store an item named “%1$@”. Choose a different name.";
    case ErrorCode::databaseUnusable:
        return "The store's records cannot be opened.";
    }
    return "";
}

ErrorCode codeForErrno(int number, bool writing) {
    switch (number) {
    case ENOENT:
    case ENOTDIR:
        return ErrorCode::noSuchItem;
    case EACCES:
    case EPERM:
        return writing ? ErrorCode::writeNoPermission : ErrorCode::readNoPermission;
    case EEXIST:
        return ErrorCode::fileExists;
    case ENOTEMPTY:
        return ErrorCode::folderNotEmpty;
    case ENAMETOOLONG:
        return ErrorCode::nameTooLong;
    case ENOSPC:
    case EDQUOT:
        return ErrorCode::outOfSpace;
    case EROFS:
        return ErrorCode::readOnlyVolume;
    case EBUSY:
    case ETXTBSY:
        return ErrorCode::itemBusy;
    case ETIMEDOUT:
        return ErrorCode::timedOut;
    case ECANCELED:
        return ErrorCode::userCancelled;
    case EINVAL:
    case EILSEQ:
        return ErrorCode::invalidArgument;
    default:
        return ErrorCode::unknownIo;
    }
}

} // namespace

Error makeError(ErrorCode code, std::string_view subject) {
    return makeErrorWithText(code, localizedFormat(textKey(code), subject));
}

Error makeErrorWithText(ErrorCode code, std::string text) {
    return {std::string(generalErrorDomain), static_cast<int>(code), std::move(text), std::nullopt};
}

Error posixError(int number, const Url& url, bool writing) {
    Error error = makeError(codeForErrno(number, writing), url.lastPathComponent());
    error.localizedFailureReason = std::strerror(number); // NOLINT(concurrency-mt-unsafe)
    return error;
}

void appendDescription(std::string& out, const Error& error) {
    out += error.domain;
    out += " (" + std::to_string(error.code) + ")";
    if (error.localizedDescription)
        out += ": " + *error.localizedDescription;
    if (error.localizedFailureReason)
        out += " [" + *error.localizedFailureReason + "]";
}

} // namespace platform
