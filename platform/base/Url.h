#pragma once

#include <compare>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace platform {

struct QueryItem {
    std::string name;
    std::string value;
    bool operator==(const QueryItem&) const = default;
};

/// Undoes percent-encoding. Answers none when a "%" is not followed by two hexadecimal digits.
std::optional<std::string> percentDecoded(std::string_view text);
/// Encodes every byte outside RFC 3986's unreserved set and those listed in `keep`.
std::string percentEncoded(std::string_view bytes, std::string_view keep = {});

/// A location: a file of this machine, or a request under a custom scheme. A value, cheap to copy.
///
/// Paths are bytes: a file name that is not valid UTF-8 survives every operation. A trailing slash
/// is not part of the path; it is the directory mark, which says what the maker knew of the item
/// and takes no part in equality. A URL may carry the physical location of a promised document
/// (where its placeholder lies); that takes no part in equality either.
class Url {
public:
    /// The empty URL: no scheme, no path. Not the same as "no URL" (use std::optional for that).
    Url() = default;

    /// A file URL of an absolute path. A trailing slash, or `directory`, sets the directory mark.
    static Url file(std::string_view path, bool directory = false);
    /// Splits "scheme:[//authority]path[?query][#fragment]" per RFC 3986. None when there is no
    /// scheme, or the path or the authority has broken percent-encoding. Linear in the length.
    static std::optional<Url> parse(std::string_view text);

    bool isFile() const { return scheme_ == "file"; }
    bool empty() const { return scheme_.empty() && path_.empty(); }
    const std::string& scheme() const { return scheme_; }
    const std::string& host() const { return host_; }
    /// Percent-decoded, without a trailing slash (except for "/").
    const std::string& path() const { return path_; }
    bool hasDirectoryMark() const { return directory_; }
    /// The query's items in order, decoded; an item whose encoding is broken keeps its raw text.
    std::vector<QueryItem> queryItems() const;
    /// The URL as text, percent-encoded; a directory ends in a slash.
    std::string absoluteString() const;

    /// "" for the root.
    std::string_view lastPathComponent() const;
    /// The text after the last "." of the last component, without it; "" when there is none, when
    /// the name starts with that dot, or when it ends with it.
    std::string_view pathExtension() const;
    std::vector<std::string_view> pathComponents() const;

    Url appending(std::string_view name, bool directory = false) const;
    /// The folder that holds the item, marked as a directory. None for the root and for "".
    std::optional<Url> deletingLastPathComponent() const;
    Url markedAsDirectory(bool directory) const;
    /// Resolves "." and ".." and doubled slashes by text alone; ".." above the root stays there.
    Url standardized() const;
    /// True when this path is `folder`'s path or lies below it. Textual; standardise first.
    bool isInside(const Url& folder) const;

    /// Where the placeholder of this promised document lies; none for any other URL.
    std::optional<Url> physicalUrl() const;
    Url withPhysicalUrl(const Url& physical) const;

    bool operator==(const Url& other) const {
        return path_ == other.path_ && scheme_ == other.scheme_ && host_ == other.host_ &&
               query_ == other.query_;
    }
    std::strong_ordering operator<=>(const Url& other) const;

private:
    std::string scheme_;
    std::string host_;
    std::string path_;
    std::string query_;
    bool directory_ = false;
    std::shared_ptr<const Url> physical_;
};

/// The extension of a bare file name, by the rule of Url::pathExtension.
std::string_view pathExtensionOf(std::string_view name);
/// The name without that extension and its dot.
std::string_view stemOf(std::string_view name);

void appendDescription(std::string& out, const Url& url);

} // namespace platform

template<>
struct std::hash<platform::Url> {
    std::size_t operator()(const platform::Url& url) const noexcept {
        return std::hash<std::string>{}(url.path());
    }
};
