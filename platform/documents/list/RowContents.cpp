#include "platform/documents/list/RowContents.h"

#include "platform/launch/DocumentIcons.h"
#include "platform/launch/TypeRegistry.h"
#include "platform/ui/Theme.h"

namespace platform {
namespace {

/// Several screens of rows; beyond that the oldest are not worth their memory.
constexpr std::size_t mostContents = 512;
/// Within the frame of a document's picture.
constexpr double framedIconEdge = 30;
constexpr double folderIconEdge = 38;

Image iconFor(const DocumentEntry& entry, const EntryDetails* details) {
    if (entry.kind == EntryKind::container && entry.container)
        return DocumentIcons::container(entry.container->identifier(), entry.title(),
                                        Theme::containerIcon);
    if (!isDocument(entry.kind))
        return DocumentIcons::folder(folderIconEdge);
    return DocumentIcons::forType(details && !details->typeIdentifier.empty()
                                      ? details->typeIdentifier
                                      : TypeRegistry::identifierForFileName(entry.name),
                                  framedIconEdge);
}

} // namespace

RowContent makeRowContent(const DocumentEntry& entry, const EntryDetails* details,
                          const std::string& place) {
    RowContent content;
    content.name = rowName(entry);
    content.details = rowDetails(entry, details, place);
    content.icon = iconFor(entry, details);
    content.kind = entry.kind;
    content.promised = details ? details->promised || entry.promised : entry.promised;
    return content;
}

RowContent& RowContents::at(const RowModel& model, std::size_t index) {
    const RowId row = model.idAt(index);
    if (const auto found = contents_.find(row); found != contents_.end())
        return found->second;
    if (contents_.size() >= mostContents)
        contents_.clear();
    RowContent content =
        makeRowContent(model.entryAt(index), model.detailsAt(index).get(), model.placeAt(index));
    return contents_.emplace(row, std::move(content)).first->second;
}

void RowContents::forget(const std::vector<RowId>& rows) {
    for (const RowId row : rows)
        contents_.erase(row);
}

double rowIconEdge(EntryKind kind) {
    return kind == EntryKind::container ? Theme::containerIcon : Theme::rowIcon;
}

} // namespace platform
