#include "platform/documents/model/EntryTable.h"

#include <algorithm>
#include <unordered_set>

namespace platform {
namespace {

constexpr std::uint32_t nowhere = UINT32_MAX;

constexpr std::uint32_t slotOf(RowId id) {
    return static_cast<std::uint32_t>(id);
}

bool looksTheSame(const DocumentEntry& a, const DocumentEntry& b) {
    return a.kind == b.kind && a.promised == b.promised && a.title() == b.title();
}

} // namespace

/// One batch of changes: rows that move are taken out and put back in at the end, all at once.
class EntryTable::Change {
public:
    explicit Change(EntryTable& table) : table_(table) {
        table_.indexNames();
        leaving_.resize(table_.slots_.size());
    }

    void rename(const EntryRenaming& renaming) {
        const auto found = table_.byName_.find(renaming.from);
        // Where the new name has a row already, the item was saved over it: that row stays.
        if (found == table_.byName_.end() || table_.byName_.contains(renaming.to))
            return;
        const Slot slot = found->second;
        takeOut(slot);
        DocumentEntry entry = table_.slots_[slot].entry;
        entry.name = renaming.to;
        table_.byName_.erase(found);
        put(slot, std::move(entry));
    }

    void settle(const EntryFact& fact) {
        const auto found = table_.byName_.find(fact.entry.name);
        if (found == table_.byName_.end()) {
            if (fact.present)
                insert(fact.entry);
            return;
        }
        const Slot slot = found->second;
        const bool sameKind =
            fact.present && sortGroup(fact.entry.kind) == sortGroup(table_.slots_[slot].entry.kind);
        if (sameKind) {
            update(slot, fact.entry);
            return;
        }
        takeOut(slot);
        table_.byName_.erase(found);
        gone_.push_back(slot);
        if (fact.present)
            insert(fact.entry);
    }

    bool finish() {
        if (takenOut_)
            std::erase_if(table_.order_,
                          [this](Slot slot) { return slot < leaving_.size() && leaving_[slot]; });
        for (const Slot slot : gone_)
            table_.releaseSlot(slot);
        putIn();
        if (takenOut_ || !entering_.empty())
            table_.positions_.clear();
        return takenOut_ || !entering_.empty() || shownDiffers_;
    }

private:
    void takeOut(Slot slot) {
        if (entering_.erase(slot) != 0 || slot >= leaving_.size())
            return;
        leaving_[slot] = true;
        takenOut_ = true;
    }

    void put(Slot slot, DocumentEntry entry) {
        table_.slots_[slot].entry = std::move(entry);
        table_.byName_.emplace(table_.slots_[slot].entry.name, slot);
        entering_.insert(slot);
    }

    void insert(const DocumentEntry& entry) {
        const Slot slot = table_.takeSlot(entry);
        table_.byName_.emplace(table_.slots_[slot].entry.name, slot);
        entering_.insert(slot);
    }

    void update(Slot slot, const DocumentEntry& entry) {
        Row& row = table_.slots_[slot];
        ++row.version;
        row.detailsStale = true;
        shownDiffers_ = true;
        if (looksTheSame(row.entry, entry))
            return;
        // The name stays as it is: the index points at it.
        row.entry.kind = entry.kind;
        row.entry.promised = entry.promised;
        row.entry.container = entry.container;
    }

    void putIn() {
        const auto before = [this](Slot a, Slot b) {
            return table_.names_.before(table_.slots_[a].entry, table_.slots_[b].entry);
        };
        std::vector<Slot> entering(entering_.begin(), entering_.end());
        std::sort(entering.begin(), entering.end(), before);
        std::vector<std::size_t> places;
        for (const Slot slot : entering)
            places.push_back(table_.positionFor(table_.slots_[slot].entry));
        std::vector<Slot>& order = table_.order_;
        const std::size_t former = order.size();
        order.resize(former + entering.size());
        std::size_t end = former;
        for (std::size_t i = entering.size(); i-- > 0;) {
            const auto at = [&](std::size_t index) {
                return order.begin() + static_cast<std::ptrdiff_t>(index);
            };
            std::move_backward(at(places[i]), at(end), at(end + i + 1));
            end = places[i];
            order[end + i] = entering[i];
        }
    }

    EntryTable& table_;
    std::vector<bool> leaving_;
    std::unordered_set<Slot> entering_;
    std::vector<Slot> gone_;
    bool takenOut_ = false;
    bool shownDiffers_ = false;
};

const EntryTable::Row* EntryTable::find(RowId id) const {
    const Slot slot = slotOf(id);
    return id != 0 && slot < slots_.size() && slots_[slot].id == id ? &slots_[slot] : nullptr;
}

EntryTable::Row* EntryTable::rowOf(RowId id) {
    return const_cast<Row*>(find(id));
}

const EntryTable::Row* EntryTable::find(std::string_view name) const {
    indexNames();
    const auto found = byName_.find(name);
    return found == byName_.end() ? nullptr : &slots_[found->second];
}

std::optional<std::size_t> EntryTable::indexOf(RowId id) const {
    if (!find(id))
        return std::nullopt;
    if (positions_.empty()) {
        positions_.assign(slots_.size(), nowhere);
        for (std::size_t i = 0; i < order_.size(); ++i)
            positions_[order_[i]] = static_cast<std::uint32_t>(i);
    }
    return positions_[slotOf(id)];
}

void EntryTable::adopt(std::vector<DocumentEntry> sorted) {
    indexNames();
    std::vector<Slot> former = std::move(order_);
    std::unordered_map<std::string_view, Slot> known = std::move(byName_);
    byName_.clear();
    namesIndexed_ = false;
    positions_.clear();
    order_.clear();
    order_.reserve(sorted.size());
    std::vector<bool> kept(slots_.size());
    for (DocumentEntry& entry : sorted) {
        const auto found = known.find(entry.name);
        if (found == known.end() ||
            sortGroup(slots_[found->second].entry.kind) != sortGroup(entry.kind)) {
            order_.push_back(takeSlot(std::move(entry)));
            continue;
        }
        Row& row = slots_[found->second];
        row.entry.kind = entry.kind;
        row.entry.promised = entry.promised;
        row.entry.container = std::move(entry.container);
        ++row.version;
        row.detailsStale = true;
        kept[found->second] = true;
        order_.push_back(found->second);
    }
    for (const Slot slot : former)
        if (!kept[slot])
            releaseSlot(slot);
}

bool EntryTable::apply(const EntryChanges& changes) {
    Change change(*this);
    for (const EntryRenaming& renaming : changes.renamings)
        change.rename(renaming);
    for (const EntryFact& fact : changes.facts)
        change.settle(fact);
    return change.finish();
}

void EntryTable::clear() {
    byName_.clear();
    namesIndexed_ = false;
    positions_.clear();
    order_.clear();
    free_.clear();
    slots_.clear();
}

bool EntryTable::setDetails(RowId id, std::uint32_t version,
                            std::shared_ptr<const EntryDetails> details) {
    Row* const row = rowOf(id);
    if (!row)
        return false;
    row->details = std::move(details);
    row->detailsStale = row->version != version;
    return !row->detailsStale;
}

void EntryTable::markDetailsStale(RowId id) {
    if (Row* const row = rowOf(id)) {
        row->detailsStale = true;
        ++row->version; // what is being read may be older
    }
}

EntryTable::Slot EntryTable::takeSlot(DocumentEntry entry) {
    Slot slot = static_cast<Slot>(slots_.size());
    if (free_.empty()) {
        slots_.emplace_back();
    } else {
        slot = free_.back();
        free_.pop_back();
    }
    Row& row = slots_[slot];
    row.entry = std::move(entry);
    row.id = (static_cast<RowId>(++lastGeneration_) << 32) | slot;
    return slot;
}

void EntryTable::releaseSlot(Slot slot) {
    slots_[slot] = Row{};
    free_.push_back(slot);
}

void EntryTable::indexNames() const {
    if (namesIndexed_)
        return;
    namesIndexed_ = true;
    byName_.reserve(order_.size());
    for (const Slot slot : order_)
        byName_.emplace(slots_[slot].entry.name, slot);
}

std::size_t EntryTable::positionFor(const DocumentEntry& entry) const {
    const auto place = std::lower_bound(
        order_.begin(), order_.end(), entry,
        [this](Slot a, const DocumentEntry& b) { return names_.before(slots_[a].entry, b); });
    return static_cast<std::size_t>(place - order_.begin());
}

} // namespace platform
