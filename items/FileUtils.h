#pragma once

#include "platform/base/Result.h"
#include "platform/base/Value.h"
#include "platform/cloud/ItemAttributes.h"

#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace platform {
class CloudContainer;
}

namespace tavrin {

/// Every change to the store goes through here, under file coordination; and the rules about names,
/// types and containers. No state. Synchronous: a call returns after its work is done, on the
/// calling thread. Paths are compared as exact strings.
class FileUtils {
public:
    FileUtils() = delete;

    /// What the platform reports of the document even when only its placeholder is here, else what
    /// the file system says; none when neither does.
    static platform::Value getResourceValue(platform::ResourceKey key,
                                            const std::optional<platform::Url>& url);

    static bool exists(const platform::Url& url);
    /// Something stands there and it is no folder.
    static bool isFile(const platform::Url& url);
    static bool isDir(const platform::Url& url);

    /// Makes the folder and missing ones above it.
    [[nodiscard]] static platform::Failure mkdir(const platform::Url& folder);
    /// Deletes the item, a folder with its contents.
    [[nodiscard]] static platform::Failure remove(const platform::Url& item);
    /// Moves or renames to the full new location. Never overwrites: a taken name becomes the first
    /// free numbered one. unsupportedOperation for a file onto a folder and the other way round.
    [[nodiscard]] static platform::Failure move(const platform::Url& source,
                                                const platform::Url& to);
    /// Drops the local copy and keeps the document in the cloud. A failure is only logged.
    static void evictDocument(const platform::Url& document);
    /// Something stands at the URL, or a document that is not on the device is promised there: a
    /// name that nothing else may get.
    static bool isTaken(const platform::Url& url);
    /// A free name in the folder of `taken`, whose own name is in use.
    static platform::Url generateUniquePath(const platform::Url& taken);
    /// "Report 2.pdf" for "Report.pdf"; none when the name itself is free.
    static std::optional<std::string>
    stringByUniquingPathInsideDirectory(std::string_view folder, std::string_view forBasename);
    /// The application's own documents folder.
    static std::optional<platform::Url> docDir();
    /// Logs dates and size of a file.
    static void logFileAttributes(std::string_view path);

    /// The text may be a file or folder name. No limit of length: that is the file system's.
    static bool isValidFilename(std::string_view name);
    /// By the extension.
    static bool isAudioVideoImageFile(const platform::Url& url);
    /// The container that holds the URL accepts files with this extension.
    static bool isValidExtensionForContainer(const platform::Url& url);
    static std::optional<std::string> containerIdForURL(const platform::Url& url);
    /// Fills what it is given on success: the container, and the path components from its documents
    /// folder down to the item (left untouched at the container's top and above).
    [[nodiscard]] static platform::Failure
    containerAndRelativePathforURL(const platform::Url& url,
                                   std::shared_ptr<const platform::CloudContainer>* container,
                                   std::vector<std::string>* relativePathComponents);
    /// The libraries and folders that lead to the item, for people; none outside every container.
    static std::optional<std::string> displayableLocationForURL(const platform::Url& url);
};

} // namespace tavrin
