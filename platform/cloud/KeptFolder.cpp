#include "platform/cloud/KeptFolder.h"

#include "platform/base/Log.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/cloud/SyncNames.h"
#include "platform/files/PathText.h"

#include <algorithm>
#include <chrono>

namespace platform {
namespace {

constexpr const char* onlyHereMark = " only here";
/// Items of one path that may be kept within one second.
constexpr int placesAtOnce = 1000;
constexpr auto keptFor = std::chrono::hours(24 * 30);

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

void KeptFolder::expire() {
    const Result<std::vector<DirectoryEntry>> moments =
        context_.disk.entries(context_.layout.kept());
    const Result<std::uint64_t> free = context_.disk.freeBytes(context_.layout.kept());
    if (!moments || !free)
        return;
    std::vector<std::string> names; // the newest first
    for (const DirectoryEntry& moment : *moments)
        if (dateOfText(moment.name) && !moment.name.ends_with(onlyHereMark))
            names.push_back(moment.name);
    std::sort(names.rbegin(), names.rend());
    std::uint64_t bytes = 0;
    for (const std::string& name : names) {
        const std::string path = context_.layout.kept() + '/' + name;
        bytes += sizeOf(path);
        const double age = context_.clock.now().secondsSince(*dateOfText(name));
        if (age < std::chrono::duration<double>(keptFor).count() && bytes <= *free / 10)
            continue;
        if (const Failure failure = FileManager::removeItem(Url::file(path, true)))
            platformLog(LogLevel::warning, "cloud: cannot empty %@: %@", path, *failure);
    }
}

std::uint64_t KeptFolder::sizeOf(const std::string& folder) const {
    std::uint64_t bytes = 0;
    const Result<std::vector<DirectoryEntry>> entries = context_.disk.entries(folder);
    if (!entries)
        return 0;
    for (const DirectoryEntry& entry : *entries) {
        const std::string path = folder + '/' + entry.name;
        const Result<FileAttributes> attributes = context_.disk.attributes(path);
        if (attributes)
            bytes += attributes->kind == FileKind::directory ? sizeOf(path) : attributes->size;
    }
    return bytes;
}

} // namespace platform
