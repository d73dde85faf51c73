#pragma once

#include "platform/cloud/webdav/HttpClient.h"
#include "platform/cloud/webdav/MultiStatus.h"
#include "platform/cloud/webdav/WebDavAddress.h"

#include <atomic>
#include <functional>
#include <string>
#include <string_view>
#include <vector>

namespace platform {

/// The requests that WebDAV has, on paths relative to the account's root. Each is one exchange;
/// what an answer means is for the caller to say. Blocks; safe from any thread.
class DavServer {
public:
    using Headers = std::vector<std::string>;

    DavServer(WebDavAddress address, HttpOptions options, Clock& clock)
        : address_(std::move(address)), http_(std::move(options), clock) {}

    /// Properties are asked for only where the server has them: each that it lacks costs it a line
    /// an item.
    void askFor(bool tags, bool richProperties);

    /// Hands over the folder itself and what lies in it (`depth` 1), or the item alone (0). The
    /// result is a good one only when the answer was whole and well-formed.
    HttpResult properties(std::string_view path, bool isFolder, int depth,
                          MultiStatusParser::Take take, CancelFlag& cancel);
    HttpResult head(std::string_view path, CancelFlag& cancel);
    HttpResult get(std::string_view path, Headers headers,
                   std::function<Failure(const HttpReply&, std::span<const std::byte>)> onBody,
                   CancelFlag& cancel);
    HttpResult put(std::string_view path, HttpUpload upload, Headers headers, CancelFlag& cancel);
    HttpResult put(std::string_view path, std::string_view content, Headers headers,
                   CancelFlag& cancel);
    /// Never replaces, as far as the server keeps to that.
    HttpResult move(std::string_view from, std::string_view to, bool isFolder, CancelFlag& cancel);
    HttpResult makeFolder(std::string_view path, CancelFlag& cancel);
    /// Of a folder, with all that is in it.
    HttpResult erase(std::string_view path, bool isFolder, CancelFlag& cancel);
    /// Empty tags remove the property.
    HttpResult setTags(std::string_view path, const std::string& tags, CancelFlag& cancel);
    /// At most `limit` bytes of a file, as text.
    HttpResult read(std::string_view path, std::size_t limit, std::string& text,
                    CancelFlag& cancel);

    const WebDavAddress& address() const { return address_; }
    Date now() const { return http_.serverNow(); }
    bool pause(CancelFlag& cancel) { return http_.pause(cancel); }

private:
    HttpResult plain(const char* method, std::string_view path, bool isFolder, Headers headers,
                     CancelFlag& cancel);

    const WebDavAddress address_;
    HttpClient http_;
    std::atomic<bool> tags_{false};
    std::atomic<bool> rich_{true};
};

} // namespace platform
