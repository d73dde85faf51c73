#include "platform/documents/FolderPath.h"

#include "platform/base/Identity.h"
#include "platform/cloud/CloudDocumentService.h"
#include "platform/documents/DisplayName.h"
#include "platform/files/FileManager.h"

namespace platform {
namespace {

bool isFolder(const Url& url) {
    bool directory = false;
    return FileManager::exists(url.path(), &directory) && directory;
}

/// The folders from below `top` down to `folder`, which lies inside it.
std::vector<Url> foldersBetween(const Url& top, const Url& folder) {
    std::vector<Url> folders;
    for (std::optional<Url> each = folder; each && *each != top;
         each = each->deletingLastPathComponent())
        folders.insert(folders.begin(), each->markedAsDirectory(true));
    return folders;
}

/// Where the documents of the container lie that holds the item.
std::optional<Url> documentsAround(const Url& item, const CloudDocumentService& documents) {
    const auto container = documents.containerForItemAtURL(item);
    return container && *container ? (*container)->documentsURL() : std::nullopt;
}

} // namespace

std::optional<std::vector<Url>> folderPathFromRoot(const Url& folder,
                                                   const CloudDocumentService& documents) {
    const std::optional<Url> root = documents.shelfroot();
    Url wanted = folder.standardized();
    if (!root || !documents.isInShelfroot(wanted) || !isFolder(wanted))
        return std::nullopt;
    std::vector<Url> path{*root};
    if (wanted == *root)
        return path;
    const std::optional<Url> top = documentsAround(wanted, documents);
    if (!top)
        return std::nullopt;
    // A container's own folder is shown as its documents.
    if (top->isInside(wanted))
        wanted = *top;
    if (!wanted.isInside(*top))
        return std::nullopt;
    path.push_back(*top);
    for (const Url& each : foldersBetween(*top, wanted))
        path.push_back(each);
    return path;
}

std::string folderTitle(const Url& folder, const CloudDocumentService& documents) {
    if (documents.shelfroot() == folder)
        return std::string(applicationName);
    if (documents.isDocumentsContainer(folder))
        if (const auto container = documents.containerForItemAtURL(folder))
            return displayName((*container)->localizedName());
    return displayName(folder.lastPathComponent());
}

std::optional<std::size_t> folderDepth(const Url& folder, const CloudDocumentService& documents) {
    const std::optional<Url> top = documentsAround(folder, documents);
    if (!top || !folder.isInside(*top))
        return std::nullopt;
    return foldersBetween(*top, folder).size();
}

} // namespace platform
