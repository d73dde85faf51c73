#include "platform/documents/list/RowSelection.h"

#include <algorithm>

namespace platform {

std::vector<std::size_t> RowSelection::indices(const RowModel& model) const {
    std::vector<std::size_t> all;
    all.reserve(rows_.size());
    for (const RowId row : rows_)
        if (const std::optional<std::size_t> index = model.indexOf(row))
            all.push_back(*index);
    std::sort(all.begin(), all.end());
    return all;
}

bool RowSelection::set(const std::vector<RowId>& rows) {
    std::unordered_set<RowId> wanted(rows.begin(), rows.end());
    range_.clear();
    if (wanted == rows_)
        return false;
    rows_ = std::move(wanted);
    return true;
}

void RowSelection::toggle(RowId row) {
    setAnchor(row);
    if (!rows_.insert(row).second)
        rows_.erase(row);
}

void RowSelection::setAnchor(RowId row) {
    anchor_ = row;
    range_.clear();
}

bool RowSelection::extendTo(const RowModel& model, std::size_t index) {
    const std::unordered_set<RowId> former = rows_;
    for (const RowId row : range_)
        rows_.erase(row);
    range_.clear();
    const std::size_t from = anchor_ ? model.indexOf(*anchor_).value_or(index) : index;
    if (!anchor_)
        anchor_ = model.idAt(index);
    for (std::size_t i = std::min(from, index); i <= std::max(from, index); ++i) {
        const RowId row = model.idAt(i);
        // What was selected before the range stays so when the range shrinks again.
        if (rows_.insert(row).second)
            range_.push_back(row);
    }
    return rows_ != former;
}

bool RowSelection::prune(const RowModel& model) {
    const auto gone = [&](RowId row) { return !model.contains(row); };
    std::erase_if(range_, gone);
    if (anchor_ && gone(*anchor_))
        anchor_.reset();
    return std::erase_if(rows_, gone) != 0;
}

} // namespace platform
