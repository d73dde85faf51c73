#include "platform/cloud/Sidecar.h"

#include "platform/cloud/ContentHash.h"
#include "platform/cloud/SyncNames.h"
#include "platform/cloud/Tokens.h"
#include "platform/files/FileDescriptor.h"
#include "platform/files/FileManager.h"

#include <array>
#include <cerrno>
#include <fcntl.h>
#include <sys/stat.h>
#include <sys/xattr.h>
#include <unistd.h>

namespace platform {
namespace {

constexpr std::string_view suffix = ".promise";
/// Bytes of the document's name that the cut form keeps: room for the dot, "~", sixteen digits of
/// the hash and the suffix.
constexpr std::size_t keptBytes = 200;
/// A mark with a whole name in it is the longest.
constexpr std::size_t longestMark = 512;
constexpr std::string_view version = "1";

/// The word at the head of `text`, which loses it and the blank behind.
std::string_view takeWord(std::string_view& text) {
    const std::size_t blank = text.find(' ');
    const std::string_view word = text.substr(0, blank);
    text.remove_prefix(blank == std::string_view::npos ? text.size() : blank + 1);
    return word;
}

/// Of anything but a file: none.
Result<std::optional<std::string>> markFromContent(const std::string& path) {
    const FileDescriptor file(open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NOFOLLOW | O_NONBLOCK));
    if (!file && (errno == ENOENT || errno == ENOTDIR || errno == ELOOP || errno == ENXIO))
        return std::optional<std::string>();
    struct stat status {};
    if (!file || fstat(file.get(), &status) != 0)
        return posixError(errno, Url::file(path), false);
    if (!S_ISREG(status.st_mode))
        return std::optional<std::string>();
    std::array<char, longestMark + 1> text{};
    const ssize_t length = read(file.get(), text.data(), text.size());
    if (length < 0)
        return posixError(errno, Url::file(path), false);
    if (length == 0 || length > static_cast<ssize_t>(longestMark))
        return std::optional<std::string>();
    return std::optional(std::string(text.data(), static_cast<std::size_t>(length)));
}

} // namespace

std::string encodedMark(const SidecarMark& mark) {
    std::string text(version);
    text += ' ' + mark.store + ' ' + hexText(static_cast<std::uint64_t>(mark.item));
    if (!mark.name.empty())
        text += ' ' + mark.name;
    return text;
}

std::optional<SidecarMark> decodedMark(std::string_view text) {
    if (takeWord(text) != version)
        return std::nullopt;
    SidecarMark mark;
    mark.store = takeWord(text);
    const std::optional<std::uint64_t> item = numberOfHex(takeWord(text));
    if (mark.store.empty() || !item || *item == 0 || *item > INT64_MAX)
        return std::nullopt;
    mark.item = static_cast<ItemId>(*item);
    mark.name = text;
    if (mark.name.find('/') != std::string::npos || mark.name.find('\0') != std::string::npos)
        return std::nullopt;
    return mark;
}

SidecarName sidecarNameFor(std::string_view name) {
    if (name.size() + 1 + suffix.size() > longestName)
        return shortenedSidecarNameFor(name);
    std::string text = ".";
    text += name;
    text += suffix;
    return {std::move(text), false};
}

SidecarName shortenedSidecarNameFor(std::string_view name) {
    Bytes hash = ContentHash::of(name);
    hash.resize(8);
    std::string text = ".";
    text += cutAtCharacter(name, keptBytes);
    text += '~' + hexText(hash);
    text += suffix;
    return {std::move(text), true};
}

bool hasSidecarForm(std::string_view name) {
    return name.size() > 1 + suffix.size() && name.starts_with('.') && name.ends_with(suffix);
}

std::string promisedName(std::string_view sidecarName, const SidecarMark& mark) {
    // A move changes file name and mark one after the other, so a mark's name counts only where the
    // file's name was made from it.
    if (!mark.name.empty() && shortenedSidecarNameFor(mark.name).text == sidecarName)
        return mark.name;
    return std::string(sidecarName.substr(1, sidecarName.size() - 1 - suffix.size()));
}

Result<std::optional<SidecarMark>> examineMark(const std::string& path, std::string_view store) {
    std::array<char, longestMark> text{};
    const ssize_t length = lgetxattr(path.c_str(), sidecarAttribute, text.data(), text.size());
    std::optional<SidecarMark> mark;
    if (length >= 0) {
        mark = decodedMark(std::string_view(text.data(), static_cast<std::size_t>(length)));
    } else if (errno == ENODATA || errno == EOPNOTSUPP) {
        const Result<std::optional<std::string>> content = markFromContent(path);
        if (!content)
            return content.error();
        if (*content)
            mark = decodedMark(**content);
    } else if (errno != ENOENT && errno != ENOTDIR && errno != ERANGE) {
        return posixError(errno, Url::file(path), false);
    }
    return mark && mark->store == store ? mark : std::nullopt;
}

std::optional<SidecarMark> readMark(const std::string& path, std::string_view store) {
    return examineMark(path, store).toOptional().value_or(std::nullopt);
}

bool isHalfWritten(const std::string& path, std::string_view store) {
    struct stat status {};
    if (lstat(path.c_str(), &status) != 0 || !S_ISREG(status.st_mode))
        return false;
    if (status.st_size == 0)
        return true;
    const std::optional<std::string> content =
        markFromContent(path).toOptional().value_or(std::nullopt);
    if (!content)
        return false;
    std::string head(version);
    head += ' ';
    head += store;
    // Bytes that a disk had kept room for and never got are zeros.
    const std::string_view text = std::string_view(*content).substr(0, content->find('\0'));
    return text.size() < head.size() ? head.starts_with(text) : text.starts_with(head);
}

Result<std::optional<FoundSidecar>> examineSidecar(const std::string& folder, std::string_view name,
                                                   std::string_view store) {
    const auto look = [&](const SidecarName& candidate) -> Result<std::optional<FoundSidecar>> {
        std::string path = folder + '/' + candidate.text;
        const Result<std::optional<SidecarMark>> mark = examineMark(path, store);
        if (!mark)
            return mark.error();
        if (!*mark || promisedName(candidate.text, **mark) != name)
            return std::optional<FoundSidecar>();
        return std::optional(FoundSidecar{std::move(path), **mark});
    };
    const SidecarName usual = sidecarNameFor(name);
    Result<std::optional<FoundSidecar>> found = look(usual);
    return !found || *found || usual.needsName ? found : look(shortenedSidecarNameFor(name));
}

std::optional<FoundSidecar> findSidecar(const std::string& folder, std::string_view name,
                                        std::string_view store) {
    return examineSidecar(folder, name, store).toOptional().value_or(std::nullopt);
}

bool containsPromise(const std::string& folder, std::string_view store) {
    bool found = false;
    std::vector<std::string> inner;
    const Failure ignored = FileManager::enumerate(folder, [&](const DirectoryEntry& entry) {
        if (entry.kind == FileKind::directory)
            inner.push_back(folder + '/' + entry.name);
        else if (hasSidecarForm(entry.name))
            found = readMark(folder + '/' + entry.name, store).has_value();
        return !found;
    });
    for (const std::string& each : inner)
        found = found || containsPromise(each, store);
    return found;
}

} // namespace platform
