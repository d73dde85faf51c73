#pragma once

#include "platform/files/FileManager.h"

#include <string>

// Private to the folder remote: how a directory's items are told apart.

namespace platform {

/// Who the item is, for its whole life; "" where the disk does not tell (an inode number alone is
/// used again at once). Not with the device, whose number differs from mount to mount.
std::string identityText(const FileAttributes& attributes);

/// Changes with every change of a file; of a folder, with the folder itself alone.
std::string versionText(const FileAttributes& attributes, Date now);

/// The same content as before, also after a rename (which changes a version).
inline bool sameContent(const FileAttributes& a, const FileAttributes& b) {
    return a.kind == b.kind && a.identity == b.identity && a.size == b.size &&
           a.modified == b.modified;
}

inline bool sameVersion(const FileAttributes& a, const FileAttributes& b) {
    return sameContent(a, b) && a.changed == b.changed;
}

} // namespace platform
