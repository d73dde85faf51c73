#pragma once

#include "platform/base/Date.h"
#include "platform/base/Url.h"
#include "platform/cloud/CloudContainer.h"

#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace platform {

/// In the order in which a list shows them: containers, then folders, then documents. Folders come
/// first because they are the way on: in a long list nobody should have to look for them.
enum class EntryKind : std::uint8_t { container, folder, package, file };

constexpr bool isDocument(EntryKind kind) {
    return kind == EntryKind::package || kind == EntryKind::file;
}
/// Documents stand together, whatever they are on the disk.
constexpr int sortGroup(EntryKind kind) {
    return isDocument(kind) ? 2 : static_cast<int>(kind);
}

/// One entry of a folder, as the user sees it: a document that is only promised stands here under
/// its own name. A value.
struct DocumentEntry {
    /// The bytes of the name on the disk.
    std::string name;
    EntryKind kind = EntryKind::file;
    bool promised = false;
    /// Of a container's entry.
    std::shared_ptr<const CloudContainer> container;

    /// What is shown and sorted by.
    const std::string& title() const { return container ? container->localizedName() : name; }
};

/// What the second line of a row tells; read later than the name, for the rows in view alone.
struct EntryDetails {
    std::optional<std::uint64_t> size;
    std::optional<Date> modified;
    std::string typeIdentifier;
    bool promised = false;
    bool shared = false;
    /// Of a folder, once it was counted; none where that cannot be done.
    std::optional<std::size_t> itemCount;
    /// False while the number is an earlier one, or none yet.
    bool counted = false;
};

/// Tells a row from all others of its list for as long as it lives, through renames and re-reads.
using RowId = std::uint64_t;

/// An item got another name in the same folder.
struct EntryRenaming {
    std::string from;
    std::string to;
};

/// What stands under a name now.
struct EntryFact {
    DocumentEntry entry;
    bool present = false;
};

/// A few changes of a folder: first the renamings in their order, then what is true after them.
struct EntryChanges {
    std::vector<EntryRenaming> renamings;
    std::vector<EntryFact> facts;
};

} // namespace platform
