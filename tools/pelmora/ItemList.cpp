#include "tools/pelmora/ItemList.h"

#include "platform/base/ByteCount.h"
#include "platform/files/FileManager.h"

#include <algorithm>
#include <array>
#include <map>

namespace pelmora {
namespace {

using namespace platform;

ListedItem itemAt(const CloudDocumentService& documents, const Url& url) {
    static constexpr std::array keys{ResourceKey::fileSize, ResourceKey::contentModificationDate,
                                     ResourceKey::isDirectory};
    ListedItem item;
    item.name = url.lastPathComponent();
    item.url = url;
    item.promised = documents.isPromised(url);
    Result<ResourceValues> values = documents.promisedItemAttributes(url, keys);
    if (!values)
        values = documents.plainAttributes(url, keys);
    if (!values)
        return item;
    item.size = (*values)[ResourceKey::fileSize].integer();
    item.modified = (*values)[ResourceKey::contentModificationDate].date();
    item.folder = (*values)[ResourceKey::isDirectory].boolean().value_or(false);
    return item;
}

} // namespace

Result<std::vector<ListedItem>> itemsAt(const CloudDocumentService& documents, const Url& url) {
    bool directory = false;
    const bool present = FileManager::exists(url.path(), &directory);
    if (!present && !documents.isPromised(url))
        return makeError(ErrorCode::noSuchItem, url.lastPathComponent());
    if (!directory)
        return std::vector{itemAt(documents, url)};
    const Result<std::vector<DirectoryEntry>> entries = FileManager::entries(url.path());
    if (!entries)
        return entries.error();
    std::map<std::string, Url> found; // a content and its promise are one document
    for (const DirectoryEntry& entry : *entries) {
        const Url each = url.appending(entry.name, entry.kind == FileKind::directory);
        const std::optional<Url> promised = documents.logicalURLOfPromise(each);
        const Url& shown = promised ? *promised : each;
        if (!shown.lastPathComponent().starts_with('.'))
            found.try_emplace(std::string(shown.lastPathComponent()), shown);
    }
    std::vector<ListedItem> items;
    for (const auto& [name, each] : found)
        items.push_back(itemAt(documents, each));
    return items;
}

std::string sizeText(std::int64_t bytes) {
    return byteCountText(static_cast<std::uint64_t>(bytes), ByteCountStyle::file);
}

} // namespace pelmora
