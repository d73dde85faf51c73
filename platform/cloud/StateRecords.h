#pragma once

#include "platform/base/Value.h"
#include "platform/cloud/Sidecar.h"
#include "platform/files/FileManager.h"

#include <optional>
#include <string>

// The values of the state database: one item, and what is known of it on each side.

namespace platform {

/// The item of the store's root.
inline constexpr ItemId rootItem = 1;

enum class ItemKind { file = 0, folder = 1 };
enum class Side { remote = 0, local = 1 };
enum class SharedRole { none = 0, owner = 1, participant = 2 };

/// A name in a folder.
struct Place {
    ItemId parent = 0;
    std::string name;
    bool operator==(const Place&) const = default;
};

struct ItemRow {
    ItemId id = 0;
    ItemKind kind = ItemKind::file;
    /// Where the user sees it; none while another item has that name.
    std::optional<Place> place;
};

/// The last whole observation of the remote.
struct RemoteRow {
    Place place;
    std::string etag;
    std::uint64_t size = 0;
    Date modified;
    std::optional<Date> created;
    std::string remoteId;
    SharedRole role = SharedRole::none;
    /// As in the attribute user.xdg.tags: names with commas between them.
    std::string tags;
    /// Of the folder's listing that saw it last; see StateDatabase::putScan.
    std::int64_t generation = 0;
};

/// No item of a remote has a name that begins so: it stands for "not there any more, and not yet
/// found elsewhere".
inline constexpr char displacedMark = '\0';
inline bool isDisplaced(const RemoteRow& row) {
    return row.place.name.starts_with(displacedMark);
}

/// The last whole observation of the disk.
struct LocalRow {
    Place place;
    FileIdentity identity;
    std::uint64_t size = 0;
    Date modified;
    Date changed;
    /// A placeholder, not the content.
    bool promise = false;
    std::int64_t generation = 0;
};

/// What both sides last agreed on. Written only after the effect is on the disk, or proven on the
/// remote.
struct BaseRow {
    Place place;
    std::string etag;
    std::uint64_t size = 0;
    /// SHA-256 of the content; empty for folders and promises.
    Bytes hash;
    FileIdentity identity;
    /// Of the content on the disk, as it was then.
    Date modified;
    Date changed;
};

struct ItemState {
    ItemRow item;
    std::optional<RemoteRow> remote;
    std::optional<LocalRow> local;
    std::optional<BaseRow> base;
};

/// A change that is under way, written before its first irrevocable step.
struct OpRow {
    std::int64_t id = 0;
    ItemId item = 0;
    std::string kind;
    std::string phase;
    /// Name of the staged content.
    std::string staged;
    std::string expectEtag;
    Bytes hash;
    std::uint64_t offset = 0;
    int tries = 0;
    std::optional<Date> nextAt;
    std::string error;
};

/// Set in the records when they were put back from a copy: what of them is not on the disk was not
/// deleted by anybody, as far as they tell.
inline constexpr const char* restoredKey = "restored";

/// How far the listing of a folder is.
struct ScanRow {
    std::int64_t generation = 0;
    bool complete = false;
};

/// A name that one side has and that cannot be brought to the other, with the reason.
struct RefusedRow {
    std::string name;
    std::string reason;
};

struct StoreCounts {
    std::int64_t folders = 0;
    std::int64_t files = 0;
    std::int64_t promises = 0;
    /// Bytes of all files as the remote reports them.
    std::int64_t bytes = 0;
    std::int64_t refused = 0;
};

} // namespace platform
