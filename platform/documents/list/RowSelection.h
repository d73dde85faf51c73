#pragma once

#include "platform/documents/model/RowModel.h"

#include <optional>
#include <unordered_set>
#include <vector>

namespace platform {

/// The rows that are selected in edit mode, by identity: renames and re-reads leave them selected.
/// Every change answers whether anything became different.
class RowSelection {
public:
    bool contains(RowId row) const { return rows_.contains(row); }
    std::size_t size() const { return rows_.size(); }
    /// Indices in display order.
    std::vector<std::size_t> indices(const RowModel& model) const;

    bool set(const std::vector<RowId>& rows);
    bool clear() { return set({}); }
    /// Makes the row the one from which ranges go.
    void toggle(RowId row);
    void setAnchor(RowId row);
    /// Selects from the anchor to the row, in place of the range that was made before.
    bool extendTo(const RowModel& model, std::size_t index);
    /// Drops the rows that are gone.
    bool prune(const RowModel& model);

private:
    std::unordered_set<RowId> rows_;
    std::optional<RowId> anchor_;
    std::vector<RowId> range_;
};

} // namespace platform
