#pragma once

#include "platform/base/Clock.h"
#include "platform/cloud/Remote.h"
#include "platform/cloud/webdav/WebDavProbe.h"
#include "platform/cloud/webdav/WebDavTrash.h"

#include <map>
#include <memory>
#include <mutex>
#include <set>

namespace platform {

/// A remote on a WebDAV server, of which nothing is believed that was not seen. What a server can
/// do is tried out at the first connection; changes are then made in the way that loses nothing on
/// that server: bound to the version that they replace where the server proved to keep to that,
/// else by way of hidden names, where what was displaced is looked at and put back when it was not
/// the expected one. Success is read back. What was replaced in steps or deleted lies in the hidden
/// trash for a month.
///
/// A connection that breaks off leaves open whether a change was made. The remote then looks; where
/// even that does not tell it answers timedOut, and the next listing does.
class WebDavRemote final : public Remote {
public:
    WebDavRemote(WebDavAddress address, HttpOptions options, Clock& clock);
    ~WebDavRemote() override;

    /// Makes the root's mark and tries the server out, at the first connection.
    Result<std::string> connect(CancelFlag& cancel) override;
    Result<RemoteListing> list(const std::string& path, CancelFlag& cancel) override;
    Result<RemoteEntry> entry(const std::string& path, CancelFlag& cancel) override;
    /// A content that changed a moment ago is waited for until it can be told from the next one. A
    /// connection that breaks off is taken up where it broke.
    Result<RemoteEntry> read(const std::string& path, const Sink& sink,
                             CancelFlag& cancel) override;
    Result<RemoteEntry> write(const std::string& path, const RemoteUpload& upload,
                              const RemoteCondition& condition, CancelFlag& cancel) override;
    Result<RemoteEntry> makeFolder(const std::string& path, CancelFlag& cancel) override;
    Result<RemoteEntry> move(const std::string& from, const std::string& to,
                             const std::string& etag, CancelFlag& cancel) override;
    [[nodiscard]] Failure remove(const std::string& path, ItemKind kind, const std::string& etag,
                                 CancelFlag& cancel) override;
    /// A server cannot be asked to reach its disk. What can be proved is: small contents whose
    /// version could have been given to another device's a moment later are read once more.
    [[nodiscard]] Failure sync(CancelFlag& cancel) override;
    Result<std::optional<std::uint64_t>> freeBytes(CancelFlag& cancel) override;

    /// What the server was seen to do; none before a connection.
    std::optional<WebDavCapabilities> capabilities() const;
    /// The address after what the server sent on to at the connection.
    WebDavAddress address() const;

private:
    /// What a connection has found out. Never changed; a new one takes its place.
    struct Session {
        explicit Session(WebDavAddress address, const HttpOptions& options, Clock& clock)
            : server(std::move(address), options, clock), trash(server) {}
        DavServer server;
        WebDavTrash trash;
        WebDavCapabilities can;
        /// The account's root as the server itself names it.
        std::string root;
        /// The root has a mark: without its folder it is not the one that it was.
        bool marked = false;
    };
    using Held = std::shared_ptr<Session>;
    struct Download;
    struct Upload;
    struct Unproven {
        std::string path;
        RemoteEntry entry;
        Bytes hash;
    };

    // The connection; see WebDavRemoteConnection.cpp.
    Held session() const;
    Result<Held> open(CancelFlag& cancel);
    Result<DavItem> findRoot(Session& session, std::string& url, CancelFlag& cancel);
    Result<std::string> readMark(Session& session, CancelFlag& cancel);
    Result<std::string> makeMark(Session& session, CancelFlag& cancel);
    /// The remote itself still is where it was.
    Failure checkThere(Session& session, CancelFlag& cancel);
    /// What an exchange that did not go well means for the item at that path.
    Error errorOf(Session& session, const HttpResult& result, std::string_view method,
                  std::string_view path, CancelFlag& cancel);
    /// The same of a change: a name that a server cannot have is told from other refusals.
    Error refusal(Session& session, const HttpResult& result, std::string_view method,
                  std::string_view path, CancelFlag& cancel);
    Error away() const;

    // Reading; see WebDavRemote.cpp and WebDavRemoteReading.cpp.
    Failure takeListed(Session& session, DavItem item, struct ListedFolder& folder);
    Result<RemoteEntry> find(Session& session, const std::string& path, CancelFlag& cancel);
    /// A file as it stands, in the cheapest way that this server has.
    Result<RemoteEntry> standing(Session& session, const std::string& path, CancelFlag& cancel);
    /// The same, once its version is old enough; young when that takes too long.
    Result<RemoteEntry> settled(Session& session, const std::string& path, CancelFlag& cancel);
    Result<RemoteEntry> fetch(Session& session, Download& download, CancelFlag& cancel);
    Failure takeBody(Session& session, Download& download, const HttpReply& head,
                     std::span<const std::byte> piece);
    Failure begin(Session& session, Download& download, const HttpReply& head);

    // Changes; see WebDavRemoteChanges.cpp and WebDavRemoteUploads.cpp.
    Failure checkChange(const Session& session, const std::string& path) const;
    Result<RemoteEntry> checkVersion(Session& session, const std::string& path,
                                     const std::string& etag, CancelFlag& cancel);
    /// The file at `place` is the one that `before` tells of.
    bool isSame(Session& session, const std::string& place, const RemoteEntry& before,
                CancelFlag& cancel);
    /// MOVE, with a look at both places when its answer got lost.
    HttpResult moveSurely(Session& session, const std::string& from, const std::string& to,
                          const RemoteEntry& item, CancelFlag& cancel);
    /// Moves the file to the trash; an error when what was there is another version, which then is
    /// at its place again.
    Result<std::string> displace(Session& session, const std::string& path,
                                 const RemoteEntry& expected, CancelFlag& cancel);
    /// Gives what was displaced by mistake its name again, or one beside it.
    Failure putBack(Session& session, const std::string& from, const std::string& path,
                    bool isFolder, CancelFlag& cancel);
    Failure removeFolder(Session& session, const std::string& path, CancelFlag& cancel);
    Result<RemoteEntry> writeDirectly(Session& session, Upload& upload, CancelFlag& cancel);
    Result<RemoteEntry> writeInSteps(Session& session, Upload& upload, CancelFlag& cancel);
    Result<RemoteEntry> sendHidden(Session& session, Upload& upload, const std::string& place,
                                   CancelFlag& cancel);
    Failure replaceInSteps(Session& session, Upload& upload, const std::string& place,
                           const RemoteEntry& sent, const RemoteEntry& before, CancelFlag& cancel);
    Result<RemoteEntry> accept(Session& session, Upload& upload, RemoteEntry entry, bool proven,
                               CancelFlag& cancel);
    /// Tags of the item of that path, to where it lies now.
    void sendTags(Session& session, const std::string& place, const std::string& path,
                  const std::string& tags, CancelFlag& cancel);
    /// None when the server has that content in that version.
    Failure prove(Session& session, const Unproven& content, CancelFlag& cancel);
    void renameUnproven(const std::string& from, const std::string& to);

    // Tags come with listings alone; of those that have been listed they are remembered.
    bool knowsTags(const std::string& path) const;
    std::string tagsOf(const std::string& path) const;
    void noteTags(const std::string& path, const std::string& tags);

    const WebDavAddress address_;
    const HttpOptions options_;
    Clock& clock_;
    std::mutex connecting_;
    std::mutex proving_;
    Failure doubt_; // guarded by proving_
    mutable std::mutex mutex_;
    Held session_;                            // guarded by mutex_, as are the next three
    std::set<std::string, std::less<>> listed_;
    std::map<std::string, std::string> tags_; // of the items that have any
    std::vector<Unproven> unproven_;
};

} // namespace platform
