#include "platform/documents/list/RowThumbnails.h"

#include "platform/base/Runtime.h"
#include "platform/ui/Theme.h"

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

std::optional<ThumbnailRequest> requestFor(const RowModel& model, std::size_t index,
                                           const EntryDetails& details, double scale) {
    const DocumentEntry& entry = model.entryAt(index);
    if (!isDocument(entry.kind) || !details.modified ||
        !ThumbnailLoader::makes(details.typeIdentifier))
        return std::nullopt;
    const int pixels = static_cast<int>(std::lround(Theme::rowIcon * scale));
    return ThumbnailRequest{model.idAt(index),
                            model.urlAt(index),
                            *details.modified,
                            details.typeIdentifier,
                            entry.promised || details.promised,
                            pixels,
                            scale};
}

} // namespace

RowThumbnails::RowThumbnails(std::function<void()> changed)
    : changed_(std::move(changed)),
      loader_(Runtime::current().mainQueue, [this](const ThumbnailRequest& request,
                                                   const Image& image) { take(request, image); }) {
}

void RowThumbnails::follow(const RowModel& model, std::size_t first, std::size_t end,
                           double scale) {
    std::unordered_map<RowId, Row> rows;
    std::vector<ThumbnailRequest> wanted;
    for (std::size_t i = first; i < std::min(end, model.count()); ++i) {
        const RowId id = model.idAt(i);
        Row& row = rows[id];
        if (const auto known = rows_.find(id); known != rows_.end())
            row = std::move(known->second);
        renew(row, model, i, scale);
        if (!row.request || row.answered)
            continue;
        if (std::optional<Image> image = ThumbnailLoader::remembered(*row.request)) {
            row.image = *std::move(image);
            row.answered = true;
        } else {
            wanted.push_back(*row.request);
        }
    }
    rows_ = std::move(rows);
    loader_.want(std::move(wanted));
}

void RowThumbnails::renew(Row& row, const RowModel& model, std::size_t index, double scale) {
    const auto details = model.detailsAt(index);
    const std::string& name = model.entryAt(index).name;
    if (!details || (row.details == details && row.name == name && row.scale == scale))
        return;
    const std::optional<ThumbnailRequest> before = std::move(row.request);
    row.request = requestFor(model, index, *details, scale);
    row.details = details;
    row.name = name;
    row.scale = scale;
    if (before && before == row.request)
        return;
    row.answered = false;
    // The same document under another name, or evicted, keeps its picture until the next is there.
    if (!row.request || !before || before->modified != row.request->modified)
        row.image = {};
}

const Image& RowThumbnails::of(RowId row) const {
    static const Image none;
    const auto found = rows_.find(row);
    return found == rows_.end() ? none : found->second.image;
}

void RowThumbnails::take(const ThumbnailRequest& request, const Image& image) {
    const auto found = rows_.find(request.row);
    if (found == rows_.end() || found->second.request != request)
        return;
    found->second.image = image;
    found->second.answered = true;
    changed_();
}

} // namespace platform
