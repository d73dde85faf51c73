#include "platform/cloud/DocumentReference.h"

#include "platform/files/PathText.h"

#include <cerrno>
#include <climits>
#include <cstdlib>
#include <memory>
#include <unistd.h>

namespace platform {
namespace {

/// As many links in a row as the kernel follows.
constexpr int longestChain = 40;

/// What the link says, made absolute by text; none when there is no link.
std::optional<std::string> targetText(const std::string& link) {
    std::string text(PATH_MAX, '\0');
    const ssize_t length = readlink(link.c_str(), text.data(), text.size());
    if (length <= 0)
        return std::nullopt;
    text.resize(static_cast<std::size_t>(length));
    if (!text.starts_with('/'))
        text = std::string(folderOf(link)) + '/' + text;
    return Url::file(text).standardized().path();
}

std::optional<std::string> canonical(const std::string& path) {
    const std::unique_ptr<char, decltype(&std::free)> real(realpath(path.c_str(), nullptr),
                                                           &std::free);
    return real ? std::optional<std::string>(real.get()) : std::nullopt;
}

/// Follows what the kernel cannot: links that end at a document that is only promised.
Result<std::string> followByText(const StoreView& view, std::string path) {
    for (int hops = 0; hops < longestChain; ++hops) {
        const std::optional<std::string> next = targetText(path);
        if (!next) {
            const bool promised =
                view.relative(path) &&
                findSidecar(std::string(folderOf(path)), nameOf(path), view.mark).has_value();
            return promised ? Result<std::string>(std::move(path))
                            : makeError(ErrorCode::noSuchItem, nameOf(path));
        }
        path = *next;
    }
    return posixError(ELOOP, Url::file(path), false);
}

} // namespace

Result<Url> resolveReference(const StoreView& view, const Url& link) {
    if (const std::optional<std::string> real = canonical(link.path())) {
        bool directory = false;
        FileManager::exists(*real, &directory);
        return Url::file(*real, directory);
    }
    if (errno == ELOOP)
        return posixError(ELOOP, link, false);
    const Result<std::string> path = followByText(view, link.path());
    if (!path)
        return path.error();
    return Url::file(*path);
}

bool leavesContainer(const StoreView& view, const Url& link) {
    const std::optional<std::string_view> relative = view.relative(link.path());
    if (!relative || relative->empty())
        return false;
    const std::optional<std::string> direct = targetText(link.path());
    if (!direct)
        return false;
    const std::string target = canonical(link.path()).value_or(*direct);
    const std::optional<std::string_view> inner = view.relative(target);
    const bool atTop = relative->find('/') == std::string_view::npos;
    if (!inner || atTop)
        return !inner;
    return inner->substr(0, inner->find('/')) != relative->substr(0, relative->find('/'));
}

} // namespace platform
