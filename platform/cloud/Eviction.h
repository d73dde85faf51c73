#pragma once

#include "platform/cloud/ContentHash.h"
#include "platform/cloud/Remote.h"
#include "platform/cloud/StoreContext.h"

namespace platform {

/// Turns a document whose content the remote surely has, byte for byte, into a promise: compare,
/// sidecar, record, and only then the file, by way of the staging folder. A stop between any two of
/// these leaves the document or the promise, and is undone or finished by resume().
class Eviction {
public:
    Eviction(StoreContext& context, CancelFlag& cancel) : context_(context), cancel_(cancel) {}

    /// notUploadedYet while the remote is not known to have the content. Not on the store's queue.
    [[nodiscard]] Failure evict(const std::string& relative);

    /// On the store's queue.
    static void resume(StoreContext& context, const OpRow& op);
    static bool owns(const OpRow& op);

private:
    struct Subject {
        std::string relative;
        std::string remotePath;
        ItemState state;
        FileAttributes attributes; // of the content that was compared
        Bytes hash;
        RemoteEntry version; // that has the same content
    };
    Result<Subject> subjectOf(const std::string& relative);
    Failure compare(Subject& subject);
    /// On the store's queue, as are the next two.
    Failure putPromise(const Subject& subject);
    Failure record(const Subject& subject, OpRow& op, const FoundSidecar& sidecar);
    Failure removeContent(const Subject& subject, const OpRow& op);

    StoreContext& context_;
    CancelFlag& cancel_;
};

} // namespace platform
