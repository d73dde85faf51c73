#pragma once

#include "platform/cloud/Remote.h"
#include "platform/cloud/webdav/DavServer.h"

#include <string>

namespace platform {

/// What a server does, as far as it was seen to do it: promises count for nothing.
struct WebDavCapabilities {
    /// In its own words, for logs and people.
    std::string server;
    /// The account's folder takes changes.
    bool writable = false;
    /// Listings tell an etag of each file.
    bool etags = false;
    /// Those of young versions are called weak.
    bool weakEtags = false;
    /// GET and HEAD tell the same version as a listing.
    bool headTellsVersion = false;
    /// The answer to a PUT tells the version that it made.
    bool putTellsVersion = false;
    /// A PUT bound to a version, or to a free name, is refused when that does not hold, and made
    /// when it does.
    bool conditionalPut = false;
    /// Of an upload that breaks off nothing is seen.
    bool tornPutsVanish = false;
    /// A MOVE onto a name that is taken is refused.
    bool safeMoves = false;
    /// A file keeps its version when it is moved.
    bool moveKeepsVersion = false;
    /// Or its date at least.
    bool moveKeepsDate = false;
    /// Listings tell of names that begin with a dot.
    bool showsHidden = false;
    /// A property of our own stays with a file over a change and a move.
    bool deadProperties = false;
    /// An upload can go on where one broke off.
    bool append = false;
    bool quota = false;
    /// Items have an identity for life, and tell what the user may do with them.
    bool stableIds = false;
    bool permissions = false;
    /// Contents come with the checksum of what was uploaded.
    bool checksums = false;

    /// A content may go to its name directly: what others see is the former one or the new one.
    bool directUploads() const { return conditionalPut && tornPutsVanish; }
    /// There is a way to change something that replaces nothing by mistake.
    bool takesChanges() const { return writable && (safeMoves || directUploads()); }
    std::string description() const;
};

/// Tries all of that in the remote's service folder, which has to be there, and removes what it
/// made. `root` is what the account's own folder told. An error is one of the way, or of the
/// password; a server that refuses changes is none.
class WebDavProbe {
public:
    WebDavProbe(DavServer& server, CancelFlag& cancel) : server_(server), cancel_(cancel) {}
    Result<WebDavCapabilities> run(const DavItem& root);

private:
    /// False ends the probe.
    bool look(const std::string& file);
    bool tryConditions(const std::string& file);
    bool tearUpload(const std::string& file);
    bool lookAtTorn(const std::string& file);
    bool tryHidden(const std::string& file);
    bool tryMoves(const std::string& file, const std::string& other, const std::string& moved);
    void tryProperties(const std::string& file);
    void tryAppend(const std::string& file);

    /// Notes an error of the way; answers whether there was none.
    bool went(const HttpResult& result);
    bool put(const std::string& file, std::string_view content, DavServer::Headers headers,
             int& status);
    bool seen(const std::string& file, RemoteEntry& entry, std::string* tags = nullptr);
    bool holds(const std::string& file, std::string_view content, bool& same);

    DavServer& server_;
    CancelFlag& cancel_;
    WebDavCapabilities found_;
    std::string etagOfPut_;
    Failure failure_;
};

} // namespace platform
