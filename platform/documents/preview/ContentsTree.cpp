#include "platform/documents/preview/ContentsTree.h"

#include "platform/documents/model/NameOrder.h"

#include <algorithm>
#include <limits>

namespace platform {
namespace {

/// More than a lister tells of, since folders on the way count as well; takes some 60 MB.
constexpr std::size_t mostNodes = 200'000;
/// Deeper paths end in one long name: nobody opens so many folders, and a path of slashes alone
/// would be made of nothing else.
constexpr int mostLevels = 48;
/// From here on the sort that makes keys first is the faster one.
constexpr std::size_t largeFolder = 64;

/// Takes the first name off the path; "" at its end.
std::string_view takeName(std::string_view& path) {
    for (;;) {
        const std::size_t start = path.find_first_not_of('/');
        path.remove_prefix(std::min(start, path.size()));
        const std::string_view name = path.substr(0, path.find('/'));
        path.remove_prefix(name.size());
        if (name != ".")
            return name;
    }
}

std::string keyOf(std::uint32_t folder, std::string_view name) {
    return std::to_string(folder).append(1, '/').append(name);
}

} // namespace

ContentsTree::ContentsTree() : nodes_(1) {
    nodes_[root].item.folder = true;
}

bool ContentsTree::add(std::string_view path, const Item& item) {
    std::uint32_t at = root;
    int level = 0;
    std::string_view rest = path;
    for (std::string_view name = takeName(rest); !name.empty();) {
        std::string_view after = rest;
        const std::string_view next = takeName(after);
        const bool last = next.empty() || ++level >= mostLevels;
        if (last && !next.empty())
            name = {name.data(), static_cast<std::size_t>(path.data() + path.size() - name.data())};
        const std::optional<std::uint32_t> known = child(at, name);
        if (!known && nodes_.size() >= mostNodes)
            return false;
        Item folder;
        folder.folder = true;
        if (!known)
            at = insert(at, std::string(name), last ? item : folder);
        else
            at = *known;
        Item& there = nodes_[at].item;
        if (last && known)
            there = item;
        // What holds something is a folder, whatever the archive says of it.
        there.folder = there.folder || !last || !nodes_[at].children.empty();
        if (last)
            return true;
        name = next;
        rest = after;
    }
    return true;
}

std::optional<std::uint32_t> ContentsTree::addTo(std::uint32_t folder, std::string name,
                                                 const Item& item) {
    if (nodes_.size() >= mostNodes)
        return std::nullopt;
    return insert(folder, std::move(name), item);
}

std::uint32_t ContentsTree::insert(std::uint32_t folder, std::string name, const Item& item) {
    const auto number = static_cast<std::uint32_t>(nodes_.size());
    places_.emplace(keyOf(folder, name), number);
    nodes_.push_back({std::move(name), item, folder, 0, {}});
    nodes_[folder].children.push_back(number);
    return number;
}

std::optional<std::uint32_t> ContentsTree::child(std::uint32_t folder,
                                                 std::string_view name) const {
    const auto found = places_.find(keyOf(folder, name));
    return found == places_.end() ? std::nullopt : std::optional(found->second);
}

void ContentsTree::sort(const CancelFlag& cancel) {
    const NameOrder order;
    for (Node& node : nodes_) {
        if (cancel.isCancelled())
            return;
        sortChildren(node, order, cancel);
        for (std::size_t i = 0; i < node.children.size(); ++i)
            nodes_[node.children[i]].row = static_cast<std::uint32_t>(i);
    }
}

void ContentsTree::sortChildren(Node& folder, const NameOrder& order, const CancelFlag& cancel) {
    std::vector<std::uint32_t>& children = folder.children;
    if (children.size() < largeFolder) {
        std::sort(children.begin(), children.end(), [&](std::uint32_t a, std::uint32_t b) {
            return order.before(nodes_[a].entry(), nodes_[b].entry());
        });
        return;
    }
    std::unordered_map<std::string_view, std::uint32_t> numbers;
    std::vector<DocumentEntry> entries;
    entries.reserve(children.size());
    for (const std::uint32_t number : children) {
        numbers.emplace(nodes_[number].name, number);
        entries.push_back(nodes_[number].entry());
    }
    sortEntries(entries, cancel);
    std::transform(entries.begin(), entries.end(), children.begin(),
                   [&](const DocumentEntry& entry) { return numbers.at(entry.name); });
}

std::size_t ContentsTree::fileCount() const {
    return static_cast<std::size_t>(std::count_if(
        nodes_.begin(), nodes_.end(), [](const Node& node) { return !node.item.folder; }));
}

std::uint64_t ContentsTree::totalSize() const {
    std::uint64_t total = 0;
    for (const Node& node : nodes_) {
        const std::uint64_t size = node.item.size.value_or(0);
        total = size > std::numeric_limits<std::uint64_t>::max() - total
                    ? std::numeric_limits<std::uint64_t>::max()
                    : total + size;
    }
    return total;
}

bool ContentsTree::hasEncrypted() const {
    return std::any_of(nodes_.begin(), nodes_.end(),
                       [](const Node& node) { return node.item.encrypted; });
}

std::string ContentsTree::pathOf(std::uint32_t number) const {
    std::string path;
    for (; number != root; number = nodes_[number].parent)
        path.insert(0, '/' + nodes_[number].name);
    return path;
}

std::optional<std::uint32_t> ContentsTree::find(std::string_view path) const {
    std::uint32_t at = root;
    for (std::string_view name = takeName(path); !name.empty(); name = takeName(path)) {
        const std::optional<std::uint32_t> next = child(at, name);
        if (!next)
            return std::nullopt;
        at = *next;
    }
    return at;
}

} // namespace platform
