#include "platform/cloud/webdav/WebDavAddress.h"

#include "platform/base/Text.h"
#include "platform/base/Url.h"

#include <curl/curl.h>

#include <memory>

namespace platform {
namespace {

using UrlHandle = std::unique_ptr<CURLU, decltype(&curl_url_cleanup)>;

std::string partOf(CURLU* url, CURLUPart part) {
    char* text = nullptr;
    if (curl_url_get(url, part, &text, 0) != CURLUE_OK)
        return {};
    std::string copy = text;
    curl_free(text);
    return copy;
}

Error badAddress(std::string words) {
    return makeErrorWithText(ErrorCode::invalidArgument, std::move(words));
}

} // namespace

Result<WebDavAddress> WebDavAddress::parse(std::string_view text) {
    const UrlHandle url(curl_url(), &curl_url_cleanup);
    if (curl_url_set(url.get(), CURLUPART_URL, std::string(text).c_str(), 0) != CURLUE_OK)
        return badAddress(
            localized("This is not the address of a server. It begins with “https://”."));
    const std::string scheme = partOf(url.get(), CURLUPART_SCHEME);
    if (scheme != "https" && scheme != "http")
        return badAddress(
            localized("The address of a WebDAV server begins with “https://” or “http://”."));
    if (!partOf(url.get(), CURLUPART_USER).empty() ||
        !partOf(url.get(), CURLUPART_PASSWORD).empty())
        return badAddress(localized("Give the user and the password apart from the address."));
    if (!partOf(url.get(), CURLUPART_QUERY).empty() ||
        !partOf(url.get(), CURLUPART_FRAGMENT).empty())
        return badAddress(
            localized("The address of a WebDAV folder has neither a “?” nor a “#” in it."));
    const std::optional<std::string> folder = pathOfHref(partOf(url.get(), CURLUPART_PATH));
    if (!folder)
        return badAddress(localized("The path in the address is not well-formed."));
    std::string origin = scheme + "://" + partOf(url.get(), CURLUPART_HOST);
    const std::string port = partOf(url.get(), CURLUPART_PORT);
    if (!port.empty() && port != (scheme == "https" ? "443" : "80"))
        origin += ':' + port;
    return WebDavAddress{std::move(origin), *folder};
}

std::string WebDavAddress::urlOf(std::string_view path, bool isFolder) const {
    std::string url = origin + percentEncoded(folder, "/");
    if (!path.empty())
        url += '/' + percentEncoded(path, "/");
    if (isFolder || path.empty())
        url += '/';
    return url;
}

std::optional<std::string> pathOfHref(std::string_view href) {
    if (const std::size_t scheme = href.find("://");
        scheme != std::string_view::npos && href.find('/') == scheme + 1) {
        const std::size_t slash = href.find('/', scheme + 3);
        href = slash == std::string_view::npos ? std::string_view() : href.substr(slash);
    }
    std::string path;
    while (!href.empty()) {
        const std::size_t slash = href.find('/');
        const std::string_view segment = href.substr(0, slash);
        href = slash == std::string_view::npos ? std::string_view() : href.substr(slash + 1);
        if (segment.empty())
            continue;
        const std::optional<std::string> name = percentDecoded(segment);
        if (!name || *name == "." || *name == ".." || name->find('/') != std::string::npos ||
            name->find('\0') != std::string::npos)
            return std::nullopt;
        path += '/' + *name;
    }
    return path;
}

} // namespace platform
