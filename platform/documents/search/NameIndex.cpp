#include "platform/documents/search/NameIndex.h"

#include "platform/cloud/CloudDocumentService.h"
#include "platform/cloud/NameFolding.h"
#include "platform/documents/model/NameOrder.h"
#include "platform/documents/model/StoreRootReader.h"
#include "platform/files/FileManager.h"

#include <algorithm>
#include <optional>

namespace platform {
namespace {

constexpr std::string_view arrow = " › ";

/// Smaller is better; none when the text is not in the name.
std::optional<int> rankOf(std::string_view folded, std::string_view text) {
    const std::size_t at = folded.find(text);
    if (at == std::string_view::npos)
        return std::nullopt;
    if (at == 0)
        return folded.size() == text.size() ? 0 : 1;
    constexpr std::string_view separators = " -_.,()[]";
    for (std::size_t place = at; place != std::string_view::npos;
         place = folded.find(text, place + 1))
        if (separators.find(folded[place - 1]) != std::string_view::npos)
            return 2;
    return 3;
}

} // namespace

void NameIndex::read(const CancelFlag& cancel) {
    folders_.clear();
    items_.clear();
    const std::optional<Url> root = documents_.shelfroot();
    if (!root)
        return;
    root_ = root->path();
    StoreRootReader reader(*root, documents_);
    const auto top = reader.readAll(cancel);
    if (!top)
        return;
    folders_.push_back({"", ""});
    for (const DocumentEntry& entry : *top) {
        if (isDocument(entry.kind)) {
            items_.push_back({0, entry.kind, entry.promised, entry.name, foldedName(entry.name)});
            continue;
        }
        const auto& documents = entry.container ? entry.container->documentsURL() : std::nullopt;
        const auto path =
            documents ? documents_.pathRelativeToShelfroot(*documents) : std::optional(entry.name);
        if (path)
            folders_.push_back({*path, entry.title()});
    }
    // Grows while it is walked.
    for (std::uint32_t i = 1; i < folders_.size() && !cancel.isCancelled(); ++i)
        readFolder(i, cancel);
}

void NameIndex::readFolder(std::uint32_t index, const CancelFlag& cancel) {
    FolderReader reader(Url::file(root_ + '/' + folders_[index].path, true), documents_);
    const auto entries = reader.readAll(cancel);
    if (!entries)
        return; // one that cannot be read hides only what is in it
    for (const DocumentEntry& entry : *entries) {
        items_.push_back({index, entry.kind, entry.promised, entry.name, foldedName(entry.name)});
        if (entry.kind == EntryKind::folder)
            addFolder(index, entry);
    }
}

void NameIndex::addFolder(std::uint32_t parent, const DocumentEntry& entry) {
    const Folder& above = folders_[parent];
    Folder folder{above.path + '/' + entry.name, above.place + std::string(arrow) + entry.name};
    // A link may lead back to a folder above it: the walk goes through real folders only.
    const auto attributes = FileManager::attributes(root_ + '/' + folder.path, FollowLinks::no);
    if (attributes && attributes->kind == FileKind::directory)
        folders_.push_back(std::move(folder));
}

std::vector<FoundItem> NameIndex::find(std::string_view text, const CancelFlag& cancel) const {
    const std::string wanted = foldedName(text);
    struct Hit {
        int rank;
        const Item* item;
    };
    std::vector<Hit> hits;
    for (const Item& item : items_) {
        if (const std::optional<int> rank = rankOf(item.folded, wanted))
            hits.push_back({*rank, &item});
        if (cancel.isCancelled())
            return {};
    }
    // By the folded bytes: the language's order is dear, and a text of one letter fits most names.
    const auto better = [](const Hit& a, const Hit& b) {
        if (a.rank != b.rank)
            return a.rank < b.rank;
        const int folded = a.item->folded.compare(b.item->folded);
        return folded != 0 ? folded < 0 : a.item->folder < b.item->folder;
    };
    const std::size_t count = std::min(hits.size(), mostFoundItems);
    std::partial_sort(hits.begin(), hits.begin() + static_cast<std::ptrdiff_t>(count), hits.end(),
                      better);
    // Those that are answered stand as they would in a list.
    const NameOrder names;
    std::sort(hits.begin(), hits.begin() + static_cast<std::ptrdiff_t>(count),
              [&names](const Hit& a, const Hit& b) {
                  if (a.rank != b.rank)
                      return a.rank < b.rank;
                  const int order = names.compare(a.item->name, b.item->name);
                  return order != 0 ? order < 0 : a.item->folder < b.item->folder;
              });
    std::vector<FoundItem> items;
    for (const Hit& hit : hits) {
        if (items.size() == mostFoundItems || cancel.isCancelled())
            break;
        FoundItem item = found(*hit.item);
        if (documents_.physicalURL(item.url))
            items.push_back(std::move(item));
    }
    return items;
}

FoundItem NameIndex::found(const Item& item) const {
    const Folder& folder = folders_[item.folder];
    std::string path = root_;
    if (!folder.path.empty())
        path += '/' + folder.path;
    path += '/' + item.name;
    return {Url::file(path, item.kind == EntryKind::folder),
            {item.name, item.kind, item.promised, nullptr},
            folder.place};
}

} // namespace platform
