#include "platform/documents/model/NameOrder.h"

#include "platform/documents/model/Parallel.h"

#include <QCollator>
#include <QLocale>
#include <QString>

#include <algorithm>
#include <numeric>

namespace platform {
namespace {

QString textOf(std::string_view name) {
    return QString::fromUtf8(name.data(), static_cast<qsizetype>(name.size()));
}

QCollator makeCollator() {
    // The C locale sorts by code and knows no numbers: nobody wants to read a list in that order.
    const QLocale locale = QLocale().collation();
    QCollator collator(locale.language() == QLocale::C ? QLocale(QLocale::English) : locale);
    collator.setNumericMode(true);
    return collator;
}

/// A part of the entries with the collator's keys for them: comparing keys is ten times as fast as
/// comparing names, and making a key costs as much as two comparisons.
struct KeyedPart {
    std::size_t first = 0;
    std::vector<QCollatorSortKey> keys;
    std::vector<std::uint32_t> order;
};

class KeyedSort {
public:
    KeyedSort(const std::vector<DocumentEntry>& entries, const CancelFlag& cancel)
        : entries_(entries),
          cancel_(cancel),
          parts_(parallelPieces(entries.size())),
          stride_((entries.size() + parts_.size() - 1) / parts_.size()) {}

    /// The indices of the entries in their order; empty when cancelled.
    std::vector<std::uint32_t> run() {
        inParallel(parts_.size(), [this](std::size_t part) { sortPart(part); });
        if (cancel_.isCancelled())
            return {};
        std::vector<std::uint32_t> merged;
        for (KeyedPart& part : parts_)
            merged = merge(std::move(merged), part.order);
        return merged;
    }

private:
    void sortPart(std::size_t index) {
        const QCollator collator = makeCollator();
        KeyedPart& part = parts_[index];
        part.first = index * stride_;
        const std::size_t end = std::min(entries_.size(), part.first + stride_);
        part.keys.reserve(end - part.first);
        for (std::size_t i = part.first; i < end; ++i) {
            if (cancel_.isCancelled())
                return;
            part.keys.push_back(collator.sortKey(textOf(entries_[i].title())));
        }
        part.order.resize(part.keys.size());
        std::iota(part.order.begin(), part.order.end(), static_cast<std::uint32_t>(part.first));
        std::sort(part.order.begin(), part.order.end(),
                  [this](std::uint32_t a, std::uint32_t b) { return before(a, b); });
    }

    std::vector<std::uint32_t> merge(std::vector<std::uint32_t> a,
                                     const std::vector<std::uint32_t>& b) const {
        if (a.empty())
            return b;
        std::vector<std::uint32_t> both(a.size() + b.size());
        std::merge(a.begin(), a.end(), b.begin(), b.end(), both.begin(),
                   [this](std::uint32_t left, std::uint32_t right) { return before(left, right); });
        return both;
    }

    const QCollatorSortKey& keyOf(std::uint32_t index) const {
        const KeyedPart& part = parts_[index / stride_];
        return part.keys[index - part.first];
    }

    bool before(std::uint32_t a, std::uint32_t b) const {
        const int groups = sortGroup(entries_[a].kind) - sortGroup(entries_[b].kind);
        if (groups != 0)
            return groups < 0;
        if (const int keys = keyOf(a).compare(keyOf(b)); keys != 0)
            return keys < 0;
        return entries_[a].name < entries_[b].name;
    }

    const std::vector<DocumentEntry>& entries_;
    const CancelFlag& cancel_;
    std::vector<KeyedPart> parts_;
    std::size_t stride_;
};

} // namespace

struct NameOrder::Collator {
    QCollator collator = makeCollator();
};

NameOrder::NameOrder() : collator_(std::make_unique<Collator>()) {
}
NameOrder::~NameOrder() = default;

int NameOrder::compare(std::string_view a, std::string_view b) const {
    if (const int order = collator_->collator.compare(textOf(a), textOf(b)); order != 0)
        return order;
    return a.compare(b);
}

bool NameOrder::before(const DocumentEntry& a, const DocumentEntry& b) const {
    const int groups = sortGroup(a.kind) - sortGroup(b.kind);
    if (groups != 0)
        return groups < 0;
    const int order = collator_->collator.compare(textOf(a.title()), textOf(b.title()));
    return order != 0 ? order < 0 : a.name < b.name;
}

void sortEntries(std::vector<DocumentEntry>& entries, const CancelFlag& cancel) {
    if (entries.empty())
        return;
    const std::vector<std::uint32_t> order = KeyedSort(entries, cancel).run();
    if (order.size() != entries.size())
        return;
    std::vector<DocumentEntry> sorted;
    sorted.reserve(entries.size());
    for (const std::uint32_t index : order)
        sorted.push_back(std::move(entries[index]));
    entries = std::move(sorted);
}

} // namespace platform
