#include "platform/base/Url.h"

#include <algorithm>
#include <array>

namespace platform {
namespace {

int hexDigit(char c) {
    if (c >= '0' && c <= '9')
        return c - '0';
    if (c >= 'a' && c <= 'f')
        return c - 'a' + 10;
    if (c >= 'A' && c <= 'F')
        return c - 'A' + 10;
    return -1;
}

bool isAlpha(char c) {
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z');
}
bool isDigit(char c) {
    return c >= '0' && c <= '9';
}
bool isUnreserved(char c) {
    return isAlpha(c) || isDigit(c) || c == '-' || c == '.' || c == '_' || c == '~';
}

bool isScheme(std::string_view text) {
    if (text.empty() || !isAlpha(text.front()))
        return false;
    return std::all_of(text.begin(), text.end(), [](char c) {
        return isAlpha(c) || isDigit(c) || c == '+' || c == '-' || c == '.';
    });
}

/// Cuts trailing slashes off a path (the root keeps its one) and tells whether there were any.
bool trimTrailingSlashes(std::string& path) {
    bool trimmed = path == "/";
    while (path.size() > 1 && path.back() == '/') {
        path.pop_back();
        trimmed = true;
    }
    return trimmed;
}

} // namespace

std::optional<std::string> percentDecoded(std::string_view text) {
    std::string out;
    out.reserve(text.size());
    for (std::size_t i = 0; i < text.size(); ++i) {
        if (text[i] != '%') {
            out.push_back(text[i]);
            continue;
        }
        if (i + 2 >= text.size())
            return std::nullopt;
        const int high = hexDigit(text[i + 1]);
        const int low = hexDigit(text[i + 2]);
        if (high < 0 || low < 0)
            return std::nullopt;
        out.push_back(static_cast<char>(high * 16 + low));
        i += 2;
    }
    return out;
}

std::string percentEncoded(std::string_view bytes, std::string_view keep) {
    static constexpr std::array<char, 16> digits = {'0', '1', '2', '3', '4', '5', '6', '7',
                                                    '8', '9', 'A', 'B', 'C', 'D', 'E', 'F'};
    std::string out;
    out.reserve(bytes.size());
    for (const char c : bytes) {
        if (isUnreserved(c) || keep.find(c) != std::string_view::npos) {
            out.push_back(c);
            continue;
        }
        const auto byte = static_cast<unsigned char>(c);
        out.push_back('%');
        out.push_back(digits[byte >> 4]);
        out.push_back(digits[byte & 15]);
    }
    return out;
}

Url Url::file(std::string_view path, bool directory) {
    Url url;
    url.scheme_ = "file";
    url.path_ = path;
    url.directory_ = trimTrailingSlashes(url.path_) || directory;
    return url;
}

std::optional<Url> Url::parse(std::string_view text) {
    const std::size_t colon = text.find(':');
    if (colon == std::string_view::npos || !isScheme(text.substr(0, colon)))
        return std::nullopt;
    Url url;
    url.scheme_ = text.substr(0, colon);
    std::string_view rest = text.substr(colon + 1);
    rest = rest.substr(0, rest.find('#'));
    if (const std::size_t mark = rest.find('?'); mark != std::string_view::npos) {
        url.query_ = rest.substr(mark + 1);
        rest = rest.substr(0, mark);
    }
    if (rest.starts_with("//")) {
        rest.remove_prefix(2);
        const std::size_t slash = std::min(rest.find('/'), rest.size());
        std::optional<std::string> host = percentDecoded(rest.substr(0, slash));
        if (!host)
            return std::nullopt;
        url.host_ = std::move(*host);
        rest.remove_prefix(slash);
    }
    std::optional<std::string> path = percentDecoded(rest);
    if (!path)
        return std::nullopt;
    url.path_ = std::move(*path);
    url.directory_ = trimTrailingSlashes(url.path_);
    return url;
}

std::vector<QueryItem> Url::queryItems() const {
    std::vector<QueryItem> items;
    const auto decoded = [](std::string_view raw) {
        std::optional<std::string> text = percentDecoded(raw);
        return text ? std::move(*text) : std::string(raw);
    };
    std::string_view rest = query_;
    while (!rest.empty()) {
        const std::size_t end = std::min(rest.find('&'), rest.size());
        const std::string_view pair = rest.substr(0, end);
        rest.remove_prefix(std::min(end + 1, rest.size()));
        const std::size_t equals = pair.find('=');
        const std::string_view value =
            equals == std::string_view::npos ? std::string_view() : pair.substr(equals + 1);
        items.push_back({decoded(pair.substr(0, equals)), decoded(value)});
    }
    return items;
}

std::string Url::absoluteString() const {
    std::string out = scheme_;
    if (!scheme_.empty())
        out += ':';
    if (isFile() || !host_.empty())
        out += "//";
    out += percentEncoded(host_, ":[]@");
    out += percentEncoded(path_, "/!$&'()*+,;=:@");
    if (directory_ && path_ != "/")
        out += '/';
    if (!query_.empty())
        out += '?' + query_;
    return out;
}

std::string_view Url::lastPathComponent() const {
    const std::string_view path = path_;
    const std::size_t slash = path.rfind('/');
    return slash == std::string_view::npos ? path : path.substr(slash + 1);
}

std::string_view Url::pathExtension() const {
    return pathExtensionOf(lastPathComponent());
}

std::vector<std::string_view> Url::pathComponents() const {
    std::vector<std::string_view> components;
    std::string_view rest = path_;
    while (!rest.empty()) {
        const std::size_t end = std::min(rest.find('/'), rest.size());
        if (end > 0)
            components.push_back(rest.substr(0, end));
        rest.remove_prefix(std::min(end + 1, rest.size()));
    }
    return components;
}

Url Url::appending(std::string_view name, bool directory) const {
    Url url = *this;
    url.physical_.reset();
    if (!url.path_.ends_with('/'))
        url.path_ += '/';
    while (name.starts_with('/'))
        name.remove_prefix(1);
    url.path_ += name;
    url.directory_ = trimTrailingSlashes(url.path_) || directory;
    return url;
}

std::optional<Url> Url::deletingLastPathComponent() const {
    const std::size_t slash = path_.rfind('/');
    if (slash == std::string::npos || path_ == "/")
        return std::nullopt;
    Url url = *this;
    url.physical_.reset();
    url.path_.resize(std::max<std::size_t>(slash, 1));
    trimTrailingSlashes(url.path_);
    url.directory_ = true;
    return url;
}

Url Url::markedAsDirectory(bool directory) const {
    Url url = *this;
    url.directory_ = directory;
    return url;
}

Url Url::standardized() const {
    std::vector<std::string_view> kept;
    for (const std::string_view component : pathComponents()) {
        if (component == ".")
            continue;
        if (component != "..")
            kept.push_back(component);
        else if (!kept.empty())
            kept.pop_back();
    }
    Url url = *this;
    url.physical_.reset();
    std::string path;
    path.reserve(path_.size());
    for (const std::string_view component : kept) {
        path += '/';
        path += component;
    }
    url.path_ = path.empty() ? "/" : std::move(path);
    return url;
}

bool Url::isInside(const Url& folder) const {
    const std::string& prefix = folder.path_;
    if (!path_.starts_with(prefix))
        return false;
    return path_.size() == prefix.size() || prefix == "/" || path_[prefix.size()] == '/';
}

std::optional<Url> Url::physicalUrl() const {
    return physical_ ? std::optional(*physical_) : std::nullopt;
}

Url Url::withPhysicalUrl(const Url& physical) const {
    Url url = *this;
    url.physical_ = std::make_shared<const Url>(physical);
    return url;
}

std::strong_ordering Url::operator<=>(const Url& other) const {
    if (const auto order = path_ <=> other.path_; order != 0)
        return order;
    if (const auto order = scheme_ <=> other.scheme_; order != 0)
        return order;
    if (const auto order = host_ <=> other.host_; order != 0)
        return order;
    return query_ <=> other.query_;
}

std::string_view pathExtensionOf(std::string_view name) {
    const std::size_t dot = name.rfind('.');
    if (dot == std::string_view::npos || dot == 0 || dot + 1 == name.size())
        return {};
    return name.substr(dot + 1);
}

std::string_view stemOf(std::string_view name) {
    const std::string_view extension = pathExtensionOf(name);
    return extension.empty() ? name : name.substr(0, name.size() - extension.size() - 1);
}

void appendDescription(std::string& out, const Url& url) {
    out += url.absoluteString();
}

} // namespace platform
