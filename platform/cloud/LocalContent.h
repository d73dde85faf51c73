#pragma once

#include "platform/cloud/StoreContext.h"
#include "platform/files/ContentProvider.h"

#include <string>

namespace platform {

/// A whole content of the tree that stayed the same while it was read.
struct LocalContent {
    FileAttributes attributes;
    Bytes hash;
};

/// changedWhileRead when it did not stay the same. Symbolic links are not followed.
Result<LocalContent> readLocalContent(StoreFileSystem& disk, const std::string& path,
                                      CancelFlag& cancel);

/// The same file with the same content, wherever it lies now: a rename changes no more than the
/// time of the last change.
inline bool sameContentAs(const FileAttributes& a, const FileAttributes& b) {
    return a.kind == b.kind && a.identity == b.identity && a.size == b.size &&
           a.modified == b.modified;
}

/// A promise for the document `name` of the folder, under the form of its name that is free. One
/// that lies there already for the same item is taken.
Result<FoundSidecar> makeSidecarFor(StoreContext& context, ItemId item, const std::string& folder,
                                    std::string_view name);

} // namespace platform
