#pragma once

#include "platform/documents/search/StoreSearch.h"
#include "platform/files/ContentProvider.h"

#include <string>
#include <string_view>
#include <vector>

namespace platform {

class CloudDocumentService;

/// All names below the store's root at one moment, folded for comparison. Belongs to one thread.
class NameIndex {
public:
    explicit NameIndex(const CloudDocumentService& documents) : documents_(documents) {}

    void read(const CancelFlag& cancel);
    /// Best first: names that begin with the text, then those in which a word does, then others.
    std::vector<FoundItem> find(std::string_view text, const CancelFlag& cancel) const;

private:
    struct Folder {
        /// Relative to the root; "" for the root.
        std::string path;
        /// For people: "Documents › Trips".
        std::string place;
    };
    struct Item {
        std::uint32_t folder;
        EntryKind kind;
        bool promised;
        std::string name;
        std::string folded;
    };

    void readFolder(std::uint32_t index, const CancelFlag& cancel);
    void addFolder(std::uint32_t parent, const DocumentEntry& entry);
    FoundItem found(const Item& item) const;

    const CloudDocumentService& documents_;
    std::string root_;
    std::vector<Folder> folders_;
    std::vector<Item> items_;
};

} // namespace platform
