#pragma once

#include "platform/cloud/webdav/DavServer.h"

#include <mutex>
#include <set>
#include <string>

namespace platform {

/// The hidden places of a WebDAV remote: `.pelmora/trash/DAY/PATH` for what was replaced or
/// deleted, `.pelmora/incoming/` for contents on their way. Days are the server's. Safe from any
/// thread.
class WebDavTrash {
public:
    explicit WebDavTrash(DavServer& server) : server_(server) {}

    struct Taken {
        HttpResult result;
        /// Where it lies, or would lie had the answer come.
        std::string place;
    };
    /// Moves the item there.
    Taken take(const std::string& path, bool isFolder, CancelFlag& cancel);

    /// A new name for a content on its way; its folder is there.
    HttpResult incoming(std::string& place, CancelFlag& cancel);

    /// The folder may not be there any more, nor those above it: they are made anew.
    void forget(const std::string& folder);

    /// Removes what has lain in the trash for longer than the time that is promised, and what was
    /// left on its way a day ago.
    void expire(CancelFlag& cancel);

private:
    /// Makes the folder and those above it; what is there already is fine.
    HttpResult makeFolders(const std::string& folder, CancelFlag& cancel);
    void expireIn(const std::string& folder, bool days, CancelFlag& cancel);

    DavServer& server_;
    std::mutex making_; // some servers refuse the same folder to several at once
    std::mutex mutex_;
    std::set<std::string> made_; // guarded by mutex_
};

} // namespace platform
