#include "platform/cloud/webdav/WebDavRemote.h"

#include "platform/base/Text.h"
#include "platform/base/Url.h"
#include "platform/cloud/webdav/DavVersion.h"
#include "platform/files/PathText.h"

#include <algorithm>
#include <numeric>

namespace platform {
namespace {

/// A connection may break off once without a word.
constexpr int davListingTries = 2;

Error garbledListing(std::string_view path, std::string reason) {
    Error error = makeErrorWithText(
        ErrorCode::serverRefused,
        localizedFormat("The server's list of “%1$@” makes no sense. Nothing is concluded from it; "
                        "it is asked again later.",
                        nameOf(path)));
    error.localizedFailureReason = std::move(reason);
    return error;
}

bool hasNameTwice(const std::vector<RemoteEntry>& entries) {
    std::vector<std::uint32_t> order(entries.size());
    std::iota(order.begin(), order.end(), 0U);
    std::sort(order.begin(), order.end(), [&](std::uint32_t a, std::uint32_t b) {
        return entries[a].name < entries[b].name;
    });
    return std::adjacent_find(order.begin(), order.end(), [&](std::uint32_t a, std::uint32_t b) {
               return entries[a].name == entries[b].name;
           }) != order.end();
}

} // namespace

/// A listing while it arrives.
struct ListedFolder {
    const std::string& path;
    /// As the server names it, decoded; and in its own spelling, with a slash at the end.
    std::string self;
    std::string spelled = {};
    bool sawSelf = false;
    bool isFile = false;
    bool sawService = false;
    RemoteListing listing = {};
    std::map<std::string, std::string> tags = {};
};

Failure WebDavRemote::takeListed(Session& session, DavItem item, ListedFolder& folder) {
    std::string_view rest;
    std::optional<std::string> name;
    if (!folder.spelled.empty() && item.href.starts_with(folder.spelled)) {
        rest = std::string_view(item.href).substr(folder.spelled.size());
        if (rest.ends_with('/'))
            rest.remove_suffix(1);
        if (rest.find('/') == std::string_view::npos && !rest.empty())
            name = percentDecoded(rest);
    }
    if (!name) {
        const std::optional<std::string> path = pathOfHref(item.href);
        if (path && *path == folder.self) {
            folder.isFile = item.hasProperties && !item.isCollection;
            folder.sawSelf = folder.sawSelf || item.hasProperties;
            folder.spelled = item.href.ends_with('/') ? item.href : item.href + '/';
            return std::nullopt;
        }
        const bool inside = path && folderOf(*path) == (folder.self.empty() ? "/" : folder.self);
        if (!inside)
            return garbledListing(folder.path, "It names “" + item.href + "”.");
        name = std::string(nameOf(*path));
    }
    if (folder.path.empty() && *name == remoteServiceFolder) {
        folder.sawService = true;
        return std::nullopt;
    }
    if (name->empty() || *name == "." || *name == ".." || name->find('/') != std::string::npos ||
        name->find('\0') != std::string::npos) {
        folder.listing.refused.push_back(
            {std::string(rest), localized("The disk cannot have an item of that name.")});
        return std::nullopt;
    }
    // Of an item that the server only has trouble with nothing is known: not even that it is gone.
    if (!item.hasProperties && item.status != 401 && item.status != 403)
        return garbledListing(folder.path,
                              "“" + *name + "”: HTTP " + std::to_string(item.status));
    if (!item.tags.empty())
        folder.tags.emplace(*name, item.tags);
    std::string reason;
    std::string shown = *name;
    if (auto entry = entryOf(item, std::move(*name), session.server.now(), session.can.etags,
                             reason))
        folder.listing.entries.push_back(std::move(*entry));
    else
        folder.listing.refused.push_back({std::move(shown), std::move(reason)});
    return std::nullopt;
}

Result<RemoteListing> WebDavRemote::list(const std::string& path, CancelFlag& cancel) {
    const Result<Held> held = open(cancel);
    if (!held)
        return held.error();
    Session& session = **held;
    for (int attempt = 1;; ++attempt) {
        ListedFolder folder{path, path.empty() ? session.root : session.root + '/' + path};
        const HttpResult result = session.server.properties(
            path, true, 1,
            [&](DavItem item) { return takeListed(session, std::move(item), folder); }, cancel);
        if (result.trouble == HttpTrouble::broken && attempt < davListingTries)
            continue;
        if (!result.ok() || result.reply.status != 207)
            return errorOf(session, result, "PROPFIND", path, cancel);
        if (!folder.sawSelf)
            return garbledListing(path, "It does not tell of the folder itself.");
        if (folder.isFile)
            return makeError(ErrorCode::noSuchItem, nameOf(path));
        if (path.empty() && session.marked && !folder.sawService) // or it is one of those it hides
            if (Failure gone = checkThere(session, cancel))
                return *gone;
        if (hasNameTwice(folder.listing.entries))
            return garbledListing(path, "It has a name twice.");
        const std::lock_guard lock(mutex_);
        const std::string prefix = path.empty() ? path : path + '/';
        const auto belongs = [&](const auto& known) {
            return known.first.starts_with(prefix) &&
                   known.first.find('/', prefix.size()) == std::string::npos;
        };
        std::erase_if(tags_, belongs);
        for (auto& [name, tags] : folder.tags)
            tags_[prefix + name] = std::move(tags);
        listed_.insert(path);
        return std::move(folder.listing);
    }
}

Result<RemoteEntry> WebDavRemote::find(Session& session, const std::string& path,
                                       CancelFlag& cancel) {
    const std::string self = path.empty() ? session.root : session.root + '/' + path;
    for (int attempt = 1;; ++attempt) {
        std::optional<DavItem> found;
        const HttpResult result = session.server.properties(
            path, false, 0,
            [&](DavItem item) -> Failure {
                if (pathOfHref(item.href) == self)
                    found = std::move(item);
                return std::nullopt;
            },
            cancel);
        if (result.trouble == HttpTrouble::broken && attempt < davListingTries)
            continue;
        if (!result.ok() || result.reply.status != 207)
            return errorOf(session, result, "PROPFIND", path, cancel);
        if (found && (found->status == 404 || found->status == 410))
            return errorOf(session, {{}, {}, HttpReply{404, {}, {}}}, "PROPFIND", path, cancel);
        if (!found || !found->hasProperties)
            return garbledListing(path, "It does not tell of the item itself.");
        noteTags(path, found->tags);
        std::string reason;
        std::optional<RemoteEntry> entry =
            entryOf(*found, std::string(nameOf(path)),
                    result.reply.date().value_or(session.server.now()), session.can.etags, reason);
        if (!entry)
            return makeErrorWithText(ErrorCode::serverRefused, std::move(reason));
        return std::move(*entry);
    }
}

Result<RemoteEntry> WebDavRemote::entry(const std::string& path, CancelFlag& cancel) {
    const Result<Held> held = open(cancel);
    return held ? find(**held, path, cancel) : Result<RemoteEntry>(held.error());
}

Result<std::optional<std::uint64_t>> WebDavRemote::freeBytes(CancelFlag& cancel) {
    const Result<Held> held = open(cancel);
    if (!held)
        return held.error();
    std::optional<std::uint64_t> free;
    if (!(*held)->can.quota)
        return free;
    std::string url;
    const Result<DavItem> root = findRoot(**held, url, cancel);
    if (!root)
        return root.error();
    if (root->quotaAvailable && *root->quotaAvailable >= 0) // below 0 it is not known, or endless
        free = static_cast<std::uint64_t>(*root->quotaAvailable);
    return free;
}

bool WebDavRemote::knowsTags(const std::string& path) const {
    const std::lock_guard lock(mutex_);
    return path.find('/') == std::string::npos ? listed_.contains("")
                                               : listed_.contains(folderOf(path));
}

std::string WebDavRemote::tagsOf(const std::string& path) const {
    const std::lock_guard lock(mutex_);
    const auto found = tags_.find(path);
    return found == tags_.end() ? std::string() : found->second;
}

void WebDavRemote::noteTags(const std::string& path, const std::string& tags) {
    const std::lock_guard lock(mutex_);
    if (tags.empty())
        tags_.erase(path);
    else
        tags_[path] = tags;
}

} // namespace platform
