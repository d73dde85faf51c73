#pragma once

#include "platform/documents/model/DocumentEntry.h"
#include "platform/documents/model/NameOrder.h"

#include <deque>
#include <optional>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace platform {

/// The rows of a list in their order. A change of one name costs microseconds whatever the number
/// of rows; a row keeps its identity when its item is renamed, and when the folder is read again.
/// Belongs to one thread.
class EntryTable {
public:
    struct Row {
        DocumentEntry entry;
        RowId id = 0;
        /// None until somebody asked for them and they were read.
        std::shared_ptr<const EntryDetails> details;
        /// Counts the changes of the item, so that details read before one are known to be old.
        std::uint32_t version = 0;
        /// Details that belong to an earlier version, or none.
        bool detailsStale = true;
    };

    std::size_t size() const { return order_.size(); }
    const Row& at(std::size_t index) const { return slots_[order_[index]]; }
    /// None when the row is gone.
    const Row* find(RowId id) const;
    const Row* find(std::string_view name) const;
    std::optional<std::size_t> indexOf(RowId id) const;

    /// Takes a whole reading, sorted, in place of what is there. An item of the same name and kind
    /// keeps its row.
    void adopt(std::vector<DocumentEntry> sorted);
    /// Answers whether anything that a list shows has changed.
    bool apply(const EntryChanges& changes);
    void clear();

    /// Ignored when the row is gone. Answers whether the row's details are now up to date.
    bool setDetails(RowId id, std::uint32_t version, std::shared_ptr<const EntryDetails> details);
    void markDetailsStale(RowId id);

private:
    using Slot = std::uint32_t;
    class Change;

    Slot takeSlot(DocumentEntry entry);
    void releaseSlot(Slot slot);
    Row* rowOf(RowId id);
    void indexNames() const;
    std::size_t positionFor(const DocumentEntry& entry) const;

    NameOrder names_;
    // A deque: the name index points into the rows.
    std::deque<Row> slots_;
    std::vector<Slot> free_;
    std::vector<Slot> order_;
    std::uint32_t lastGeneration_ = 0;
    // Both are made when first asked for, and the second one is thrown away by every change.
    mutable std::unordered_map<std::string_view, Slot> byName_;
    mutable bool namesIndexed_ = false;
    mutable std::vector<std::uint32_t> positions_;
};

} // namespace platform
