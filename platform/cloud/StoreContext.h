#pragma once

#include "platform/base/WorkQueue.h"
#include "platform/cloud/Remote.h"
#include "platform/cloud/StateDatabase.h"
#include "platform/cloud/StoreFolder.h"

namespace platform {

class StoreFileSystem;
class TransferActivity;

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
    /// Where transfers are shown; none where nobody looks.
    TransferActivity* activity = nullptr;

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

/// The version that a listing told of, and not all of it: a content that something on the way cut
/// and passed on as whole.
inline bool isCutShort(const RemoteEntry& received, const RemoteRow& listed) {
    return received.etag == listed.etag && received.size != listed.size;
}

/// An error of the disk about a file of the store's own (a promise, a staged content, the records),
/// said of what people know: the document or the store. Others stay as they are.
inline Error namedForPeople(const Error& error, std::string_view subject) {
    for (const ErrorCode code :
         {ErrorCode::outOfSpace, ErrorCode::readOnlyVolume, ErrorCode::writeNoPermission,
          ErrorCode::readNoPermission, ErrorCode::unknownIo})
        if (error.is(code))
            return makeError(code, subject);
    return error;
}

} // namespace platform
