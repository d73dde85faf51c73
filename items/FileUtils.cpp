#include "items/FileUtils.h"

#include "app/VXLogging.h"
#include "platform/Platform.h"
#include "platform/base/Identity.h"
#include "platform/cloud/CloudDocumentService.h"
#include "platform/files/FileManager.h"

namespace tavrin {
namespace {

using platform::FileManager;
using platform::Platform;
using platform::Url;

} // namespace

platform::Value FileUtils::getResourceValue(platform::ResourceKey key,
                                            const std::optional<Url>& url) {
    if (!url)
        return {};
    const platform::CloudDocumentService& documents = Platform::current().documents();
    const platform::ResourceKeys one(&key, 1);
    if (const auto promised = documents.promisedItemAttributes(*url, one))
        if (const platform::Value& value = (*promised)[key]; !value.isNone())
            return value;
    const auto plain = documents.plainAttributes(*url, one);
    return plain ? (*plain)[key] : platform::Value();
}

bool FileUtils::exists(const Url& url) {
    return FileManager::exists(url.path());
}

bool FileUtils::isTaken(const Url& url) {
    // A link that leads nowhere holds its name as well.
    return Platform::current().documents().physicalURL(url).has_value();
}

bool FileUtils::isFile(const Url& url) {
    bool directory = false;
    return FileManager::exists(url.path(), &directory) && !directory;
}

bool FileUtils::isDir(const Url& url) {
    bool directory = false;
    return FileManager::exists(url.path(), &directory) && directory;
}

std::optional<std::string>
FileUtils::stringByUniquingPathInsideDirectory(std::string_view folder,
                                               std::string_view forBasename) {
    const Url base = Url::file(folder, true);
    if (!isTaken(base.appending(forBasename)))
        return std::nullopt;
    const std::string_view extension = platform::pathExtensionOf(forBasename);
    const std::string ending = extension.empty() ? "" : "." + std::string(extension);
    const std::string_view stem = platform::stemOf(forBasename);
    for (std::uint64_t number = 2;; ++number) {
        std::string candidate = platform::format("%@ %d%@", stem, number, ending);
        if (!isTaken(base.appending(candidate)))
            return candidate;
    }
}

Url FileUtils::generateUniquePath(const Url& taken) {
    const std::optional<Url> folder = taken.deletingLastPathComponent();
    if (!folder)
        return taken;
    // A name that has become free meanwhile may be used as it is.
    const std::optional<std::string> name =
        stringByUniquingPathInsideDirectory(folder->path(), taken.lastPathComponent());
    return name ? folder->appending(*name, taken.hasDirectoryMark()) : taken;
}

std::optional<Url> FileUtils::docDir() {
    const std::optional<Url> container =
        Platform::current().dataContainerURL(platform::applicationIdentifier);
    return container ? std::optional(container->appending("Documents", true)) : std::nullopt;
}

void FileUtils::logFileAttributes(std::string_view path) {
    const auto found = FileManager::attributes(path, platform::FollowLinks::yes);
    if (!found) {
        VXLOG(vxError, "Cannot get attributes of %@: %@", path, found.error().localizedDescription);
        return;
    }
    const platform::Date now = Platform::current().clock().now();
    if (found->created != platform::Date()) // some file systems do not know it
        VXLOG(vxDebug, "Date Created: %@ (%lf seconds ago)", found->created,
              now.secondsSince(found->created));
    VXLOG(vxDebug, "Date Modified: %@ (%lf seconds ago)", found->modified,
          now.secondsSince(found->modified));
    VXLOG(vxDebug, "Size: %@ bytes", found->size);
}

} // namespace tavrin
