#include "platform/cloud/KeptFolder.h"

#include "platform/cloud/StoreFileSystem.h"
#include "platform/cloud/SyncNames.h"
#include "platform/files/PathText.h"

namespace platform {
namespace {

constexpr const char* onlyHereMark = " only here";
/// Items of one path that may be kept within one second.
constexpr int placesAtOnce = 1000;

} // namespace

Failure KeptFolder::makeFolders(const std::string& relative) {
    std::size_t slash = 0;
    do {
        slash = relative.find('/', slash + 1);
        if (Failure failure =
                context_.disk.makeFolder(context_.layout.kept() + '/' + relative.substr(0, slash));
            failure && !failure->is(ErrorCode::fileExists))
            return failure;
    } while (slash != std::string::npos);
    return std::nullopt;
}

Result<std::string> KeptFolder::takeFrom(const std::string& from, const std::string& relative,
                                         bool onlyHere) {
    const std::string moment = momentText(context_.clock.now());
    for (int number = 1;; ++number) {
        std::string place = moment;
        if (number > 1)
            place += " " + std::to_string(number);
        if (onlyHere)
            place += onlyHereMark;
        place += '/' + relative;
        std::string path = context_.layout.kept() + '/' + place;
        Failure failure = makeFolders(std::string(folderOf(place)));
        // Of two items kept in one second one may be a file where the other has a folder.
        const bool taken = failure && failure->is(ErrorCode::noSuchItem);
        if (!failure)
            failure = context_.disk.rename(from, path);
        if (!failure)
            return path;
        const Result<FileAttributes> standing = context_.disk.attributes(path);
        const bool again = taken || failure->is(ErrorCode::fileExists) || standing.ok();
        if (!again || number == placesAtOnce)
            return *failure;
    }
}

} // namespace platform
