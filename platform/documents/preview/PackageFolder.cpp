#include "platform/documents/preview/PackageFolder.h"

#include "platform/documents/model/FolderReader.h"

#include <utility>
#include <vector>

namespace platform {
namespace {

/// Folders in folders; nobody opens more of them one by one.
constexpr int mostPackageLevels = 48;

struct OpenFolder {
    Url url;
    std::uint32_t number = ContentsTree::root;
    int level = 0;
};

ContentsTree::Item itemFor(const DocumentEntry& entry, const Url& url) {
    ContentsTree::Item item;
    item.promised = entry.promised;
    const auto attributes = FileManager::attributes(url.path(), FollowLinks::no);
    if (!attributes)
        return item;
    item.folder = attributes->kind == FileKind::directory;
    item.link = attributes->kind == FileKind::symbolicLink;
    item.modified = attributes->modified;
    if (attributes->kind == FileKind::file)
        item.size = attributes->size;
    return item;
}

} // namespace

Result<PackageContents> listPackage(const Url& package, const CloudDocumentService& documents,
                                    const CancelFlag& cancel) {
    PackageContents contents;
    std::vector<OpenFolder> open{{package}};
    while (!open.empty() && !cancel.isCancelled()) {
        const OpenFolder folder = std::move(open.back());
        open.pop_back();
        Result<std::vector<DocumentEntry>> entries =
            FolderReader(folder.url, documents).readAll(cancel);
        if (!entries && folder.level == 0)
            return entries.error();
        if (!entries) {
            contents.cut = true;
            continue;
        }
        for (DocumentEntry& entry : *entries) {
            if (cancel.isCancelled())
                return contents;
            const Url url = folder.url.appending(entry.name);
            const ContentsTree::Item item = itemFor(entry, url);
            const auto number = contents.tree->addTo(folder.number, std::move(entry.name), item);
            contents.cut = contents.cut || !number || (item.folder && folder.level >= mostPackageLevels);
            if (!number) {
                open.clear();
                break;
            }
            if (item.folder && folder.level < mostPackageLevels)
                open.push_back({url, *number, folder.level + 1});
        }
    }
    contents.tree->sort(cancel);
    return contents;
}

} // namespace platform
