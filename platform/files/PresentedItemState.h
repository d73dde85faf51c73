#pragma once

#include "platform/files/FileDescriptor.h"
#include "platform/files/FileManager.h"

namespace platform {

/// What stands at the path that somebody presents.
struct PresentedItemState {
    enum class Presence { absent, promised, present };
    Presence presence = Presence::absent;
    /// Of a present item; the link itself for a symbolic link.
    FileAttributes attributes;

    static PresentedItemState read(const std::string& path);
    bool isFolder() const {
        return presence == Presence::present && attributes.kind == FileKind::directory;
    }
    /// False when content, attributes or the item itself changed.
    bool operator==(const PresentedItemState& other) const;
};

/// Holds on to an item itself, wherever it is moved and also when it is removed. Does not open its
/// content.
class ItemHandle {
public:
    ItemHandle() = default;
    explicit ItemHandle(const std::string& path);
    /// Where the item is now; none when it was removed (or thrown into the desktop's trash, which
    /// is the same to whoever shows it), or when the system does not tell.
    std::optional<std::string> currentPath() const;

private:
    FileDescriptor item_;
};

} // namespace platform
