#include "platform/cloud/webdav/DavServer.h"

#include <algorithm>
#include <cstring>

namespace platform {
namespace {

constexpr const char* xmlType = "Content-Type: application/xml; charset=utf-8";

std::string xmlText(std::string_view text) {
    std::string escaped;
    for (const char c : text)
        if (c == '&')
            escaped += "&amp;";
        else if (c == '<')
            escaped += "&lt;";
        else if (c == '>')
            escaped += "&gt;";
        else
            escaped += c;
    return escaped;
}

} // namespace

void DavServer::askFor(bool tags, bool richProperties) {
    tags_ = tags;
    rich_ = richProperties;
}

HttpResult DavServer::properties(std::string_view path, bool isFolder, int depth,
                                 MultiStatusParser::Take take, CancelFlag& cancel) {
    MultiStatusParser parser(std::move(take));
    HttpRequest request{"PROPFIND", address_.urlOf(path, isFolder)};
    request.headers = {"Depth: " + std::to_string(depth), xmlType, "Expect:"};
    request.body = std::string("<?xml version=\"1.0\" encoding=\"utf-8\"?>"
                               "<propfind xmlns=\"DAV:\"><prop><resourcetype/><getcontentlength/>"
                               "<getlastmodified/><getetag/>");
    if (tags_)
        request.body += std::string("<t:tags xmlns:t=\"") + storeNamespace + "\"/>";
    if (rich_)
        request.body += std::string("<quota-available-bytes/><o:id xmlns:o=\"") + richNamespace +
                        "\"/><o:permissions xmlns:o=\"" + richNamespace + "\"/>";
    request.body += "</prop></propfind>";
    bool whole = false;
    request.onBody = [&](const HttpReply& reply, std::span<const std::byte> piece) -> Failure {
        if (reply.status != 207)
            return std::nullopt;
        whole = true;
        return parser.feed(piece);
    };
    HttpResult result = http_.perform(request, cancel);
    if (result.ok() && result.reply.status == 207)
        if (Failure failure = whole ? parser.finish() : parser.feed({}))
            return {HttpTrouble::caller, std::move(failure), std::move(result.reply)};
    return result;
}

HttpResult DavServer::plain(const char* method, std::string_view path, bool isFolder,
                            Headers headers, CancelFlag& cancel) {
    HttpRequest request{method, address_.urlOf(path, isFolder), std::move(headers)};
    return http_.perform(request, cancel);
}

HttpResult DavServer::head(std::string_view path, CancelFlag& cancel) {
    return plain("HEAD", path, false, {}, cancel);
}

HttpResult
DavServer::get(std::string_view path, Headers headers,
               std::function<Failure(const HttpReply&, std::span<const std::byte>)> onBody,
               CancelFlag& cancel) {
    // No encoding is accepted: it would give the content another version and other offsets.
    HttpRequest request{"GET", address_.urlOf(path, false), std::move(headers)};
    request.onBody = std::move(onBody);
    return http_.perform(request, cancel);
}

HttpResult DavServer::put(std::string_view path, HttpUpload upload, Headers headers,
                          CancelFlag& cancel) {
    HttpRequest request{"PUT", address_.urlOf(path, false), std::move(headers)};
    request.headers.emplace_back("Content-Type: application/octet-stream");
    request.upload = std::move(upload);
    return http_.perform(request, cancel);
}

HttpResult DavServer::put(std::string_view path, std::string_view content, Headers headers,
                          CancelFlag& cancel) {
    const auto read = [content](std::uint64_t offset,
                                std::span<std::byte> buffer) -> Result<std::size_t> {
        const std::string_view left =
            content.substr(std::min<std::size_t>(content.size(), offset), buffer.size());
        std::memcpy(buffer.data(), left.data(), left.size());
        return left.size();
    };
    return put(path, {content.size(), read}, std::move(headers), cancel);
}

HttpResult DavServer::move(std::string_view from, std::string_view to, bool isFolder,
                           CancelFlag& cancel) {
    return plain("MOVE", from, isFolder,
                 {"Overwrite: F", "Destination: " + address_.urlOf(to, isFolder)}, cancel);
}

HttpResult DavServer::makeFolder(std::string_view path, CancelFlag& cancel) {
    return plain("MKCOL", path, true, {}, cancel);
}

HttpResult DavServer::erase(std::string_view path, bool isFolder, CancelFlag& cancel) {
    return plain("DELETE", path, isFolder, {}, cancel);
}

HttpResult DavServer::setTags(std::string_view path, const std::string& tags, CancelFlag& cancel) {
    HttpRequest request{"PROPPATCH", address_.urlOf(path, false), {xmlType}};
    const std::string property = std::string("<prop><t:tags xmlns:t=\"") + storeNamespace + "\">" +
                                 xmlText(tags) + "</t:tags></prop>";
    const char* const what = tags.empty() ? "remove" : "set";
    request.body = std::string("<?xml version=\"1.0\" encoding=\"utf-8\"?>"
                               "<propertyupdate xmlns=\"DAV:\"><") +
                   what + '>' + property + "</" + what + "></propertyupdate>";
    return http_.perform(request, cancel);
}

HttpResult DavServer::read(std::string_view path, std::size_t limit, std::string& text,
                           CancelFlag& cancel) {
    text.clear();
    return get(
        path, {},
        [&](const HttpReply&, std::span<const std::byte> piece) -> Failure {
            if (text.size() + piece.size() > limit)
                return makeError(ErrorCode::readCorrupt, path);
            text.append(reinterpret_cast<const char*>(piece.data()), piece.size());
            return std::nullopt;
        },
        cancel);
}

} // namespace platform
