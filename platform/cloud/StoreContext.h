#pragma once

#include "platform/base/WorkQueue.h"
#include "platform/cloud/StateDatabase.h"
#include "platform/cloud/StoreFolder.h"

namespace platform {

class Remote;
class StoreFileSystem;

/// An open store, as those who work on it see it. Outlives them.
struct StoreContext {
    const StoreLayout& layout;
    /// What this store's promises are marked with.
    const std::string& mark;
    StoreFileSystem& disk;
    Remote& remote;
    Clock& clock;
    /// The serial queue that owns the state: the only place where the database is asked or changed.
    /// Nothing on it waits for the remote.
    WorkQueue& queue;
    StateDatabase& database;

    std::string pathOf(const std::string& relative) const {
        return relative.empty() ? layout.root() : layout.root() + '/' + relative;
    }
};

/// The observation of what stands on the disk.
inline LocalRow localRowOf(const Place& place, const FileAttributes& attributes, bool promise) {
    return {place,
            attributes.identity,
            attributes.size,
            attributes.modified,
            attributes.changed,
            promise,
            0};
}

/// What both sides agree on, with the disk as it is now.
inline BaseRow baseRowOf(const Place& place, const std::string& etag, std::uint64_t size,
                         Bytes hash, const FileAttributes& here) {
    return {place, etag, size, std::move(hash), here.identity, here.modified, here.changed};
}

} // namespace platform
