#pragma once

#include "platform/base/Result.h"

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace platform {

/// Identity of an item of a store: never used again, also not by a database that was made anew.
using ItemId = std::int64_t;

/// Bytes of a name that disks of this system can hold.
inline constexpr std::size_t longestName = 255;

/// A promise is a hidden, empty file beside the place of the document that it promises. Its mark
/// says whose promise it is: the store, the item and, where the sidecar's own name had to be
/// shortened, the document's whole name.
struct SidecarMark {
    std::string store;
    ItemId item = 0;
    /// "" when the sidecar's name holds the document's.
    std::string name;
    bool operator==(const SidecarMark&) const = default;
};

/// The extended attribute that holds the mark; the content does where the disk has no attributes.
inline constexpr const char* sidecarAttribute = "user.pelmora.promise";

std::string encodedMark(const SidecarMark& mark);
std::optional<SidecarMark> decodedMark(std::string_view text);

/// ".Name.promise". A name that leaves no room for that is cut, with a hash of the whole name
/// behind it; `needsName` then tells that the mark must hold the name.
struct SidecarName {
    std::string text;
    bool needsName = false;
};
SidecarName sidecarNameFor(std::string_view name);
/// The cut form, also for a short name: used where the plain one is taken by a file of the user's.
SidecarName shortenedSidecarNameFor(std::string_view name);
/// Has the form of a sidecar's name. Whether it is one is for its mark to say.
bool hasSidecarForm(std::string_view name);
/// The document's name behind a sidecar's name and mark.
std::string promisedName(std::string_view sidecarName, const SidecarMark& mark);

/// The mark of the file at `path` when it is a promise of `store`; a file without a valid mark is
/// the user's own.
std::optional<SidecarMark> readMark(const std::string& path, std::string_view store);
/// The same for those to whom it matters that it could not be read: that says nothing.
Result<std::optional<SidecarMark>> examineMark(const std::string& path, std::string_view store);

/// A promise whose making, or whose disk, was interrupted: nothing, zeros, or the beginning of a
/// mark of `store`. Only for names of the sidecars' form without a valid mark.
bool isHalfWritten(const std::string& path, std::string_view store);

struct FoundSidecar {
    std::string path;
    SidecarMark mark;
};
/// The promise of the document `name` in `folder`, under either form of its name.
std::optional<FoundSidecar> findSidecar(const std::string& folder, std::string_view name,
                                        std::string_view store);

/// The same for those to whom it matters that it could not be read.
Result<std::optional<FoundSidecar>> examineSidecar(const std::string& folder, std::string_view name,
                                                   std::string_view store);

/// Whether any document below the folder is only promised.
bool containsPromise(const std::string& folder, std::string_view store);

} // namespace platform
