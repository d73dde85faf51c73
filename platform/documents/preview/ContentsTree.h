#pragma once

#include "platform/base/Date.h"
#include "platform/documents/model/DocumentEntry.h"
#include "platform/files/ContentProvider.h"

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace platform {

class NameOrder;

/// What an archive or a package holds, as a tree of names. Built on a worker's queue, read on the
/// main thread afterwards.
class ContentsTree {
public:
    struct Item {
        bool folder = false;
        bool encrypted = false;
        bool link = false;
        /// Not on this device.
        bool promised = false;
        std::optional<std::uint64_t> size;
        std::optional<Date> modified;
    };
    struct Node {
        /// The bytes of the name; not for the screen as they are.
        std::string name;
        Item item;
        std::uint32_t parent = 0;
        /// Among its parent's children, once sorted.
        std::uint32_t row = 0;
        std::vector<std::uint32_t> children;

        /// As a row of a list.
        DocumentEntry entry() const {
            return {name, item.folder ? EntryKind::folder : EntryKind::file, item.promised, nullptr};
        }
    };
    static constexpr std::uint32_t root = 0;

    ContentsTree();

    /// Puts an item where its path says, with the folders on the way. A path means nothing outside
    /// the tree: it is taken from the root, and ".." is a name. An item that is there already is
    /// replaced. False when the tree is full.
    bool add(std::string_view path, const Item& item);
    /// Into a folder of the tree that holds no item of that name; none when the tree is full.
    std::optional<std::uint32_t> addTo(std::uint32_t folder, std::string name, const Item& item);
    /// Brings names into their order; to be called before the tree is shown.
    void sort(const CancelFlag& cancel);

    const Node& node(std::uint32_t number) const { return nodes_[number]; }
    /// Of files and of folders on the way to them.
    std::size_t count() const { return nodes_.size() - 1; }
    std::size_t fileCount() const;
    /// Of all files whose size is known.
    std::uint64_t totalSize() const;
    bool hasEncrypted() const;
    std::string pathOf(std::uint32_t number) const;
    /// None when there is no such item.
    std::optional<std::uint32_t> find(std::string_view path) const;

private:
    std::optional<std::uint32_t> child(std::uint32_t folder, std::string_view name) const;
    std::uint32_t insert(std::uint32_t folder, std::string name, const Item& item);
    void sortChildren(Node& folder, const NameOrder& order, const CancelFlag& cancel);

    std::vector<Node> nodes_;
    /// By the folder's number, a slash and the name.
    std::unordered_map<std::string, std::uint32_t> places_;
};

} // namespace platform
