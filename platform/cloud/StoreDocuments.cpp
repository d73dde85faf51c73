#include "platform/cloud/StoreDocuments.h"

#include "platform/base/Text.h"
#include "platform/cloud/AttributeReading.h"
#include "platform/cloud/DocumentReference.h"
#include "platform/files/PathText.h"

namespace platform {
namespace {

std::optional<std::string_view> below(std::string_view path, const std::string& root) {
    if (!path.starts_with(root))
        return std::nullopt;
    if (path.size() == root.size())
        return std::string_view();
    if (path[root.size()] != '/')
        return std::nullopt;
    return path.substr(root.size() + 1);
}

/// Textual comparison needs paths without "." and "..", which is what nearly all paths are.
bool needsStandardizing(std::string_view path) {
    return path.find("/.") != std::string_view::npos || path.find("//") != std::string_view::npos;
}

Url standardized(const Url& url) {
    return needsStandardizing(url.path()) ? url.standardized() : url;
}

Error notInStore(const Url& url) {
    return makeError(ErrorCode::noSuchItem, url.lastPathComponent());
}

std::string_view trimmed(std::string_view text) {
    while (!text.empty() && text.front() == ' ')
        text.remove_prefix(1);
    while (!text.empty() && text.back() == ' ')
        text.remove_suffix(1);
    return text;
}

std::vector<std::string> tagsOf(std::string_view text) {
    std::vector<std::string> tags;
    while (!text.empty()) {
        const std::size_t comma = text.find(',');
        if (const std::string_view tag = trimmed(text.substr(0, comma)); !tag.empty())
            tags.emplace_back(tag);
        text.remove_prefix(comma == std::string_view::npos ? text.size() : comma + 1);
    }
    return tags;
}

/// What stands at the path; of a symbolic link what it points at, as far as that is there.
Result<FileAttributes> attributesAt(const std::string& path) {
    Result<FileAttributes> attributes = FileManager::attributes(path, FollowLinks::no);
    if (!attributes || attributes->kind != FileKind::symbolicLink)
        return attributes;
    const Result<FileAttributes> target = FileManager::attributes(path, FollowLinks::yes);
    return target ? target : attributes;
}

bool standsAt(const std::string& path) {
    return FileManager::attributes(path, FollowLinks::no).ok();
}

} // namespace

std::optional<std::string_view> StoreView::relative(std::string_view path) const {
    const std::optional<std::string_view> direct = below(path, root);
    return direct ? direct : below(path, canonicalRoot);
}

std::optional<Url> StoreDocuments::shelfroot() const {
    const auto view = slot_.load();
    return view ? std::optional(Url::file(view->root, true)) : std::nullopt;
}

bool StoreDocuments::isInShelfroot(const Url& url) const {
    return pathRelativeToShelfroot(url).has_value();
}

bool StoreDocuments::isDocumentsContainer(const Url& url) const {
    const auto view = slot_.load();
    if (!view || !url.isFile())
        return false;
    const Url plain = standardized(url);
    const std::optional<std::string_view> relative = view->relative(plain.path());
    return relative && view->containers->isDocumentsRoot(*relative);
}

std::optional<std::string> StoreDocuments::pathRelativeToShelfroot(const Url& url) const {
    const auto view = slot_.load();
    if (!view || !url.isFile())
        return std::nullopt;
    const Url plain = standardized(url);
    const std::optional<std::string_view> relative = view->relative(plain.path());
    return relative ? std::optional(std::string(*relative)) : std::nullopt;
}

Result<std::shared_ptr<const CloudContainer>>
StoreDocuments::containerForItemAtURL(const Url& url) const {
    const auto view = slot_.load();
    if (!view)
        return makeError(ErrorCode::noAccount);
    const Url plain = standardized(url);
    const std::optional<std::string_view> relative =
        plain.isFile() ? view->relative(plain.path()) : std::nullopt;
    const ContainerSet::Entry* const entry =
        relative && !relative->empty() ? view->containers->holding(*relative) : nullptr;
    if (!entry)
        return notInStore(url);
    return entry->container;
}

std::vector<std::shared_ptr<const CloudContainer>> StoreDocuments::containers() const {
    std::vector<std::shared_ptr<const CloudContainer>> all;
    if (const auto view = slot_.load())
        for (const ContainerSet::Entry& entry : view->containers->entries())
            all.push_back(entry.container);
    return all;
}

std::string StoreDocuments::localizedNameForDefaultContainer() const {
    const auto view = slot_.load();
    const ContainerSet::Entry* const entry = view ? view->containers->defaultEntry() : nullptr;
    return entry ? entry->container->localizedName() : localized("Documents");
}

std::optional<Url> StoreDocuments::defaultContainerURL() const {
    const auto view = slot_.load();
    const ContainerSet::Entry* const entry = view ? view->containers->defaultEntry() : nullptr;
    return entry ? entry->container->documentsURL() : std::nullopt;
}

std::optional<FoundSidecar> StoreDocuments::promiseFor(const StoreView& view,
                                                       std::string_view path) const {
    return findSidecar(std::string(folderOf(path)), nameOf(path), view.mark);
}

Result<ResourceValues> StoreDocuments::promisedItemAttributes(const Url& url,
                                                              ResourceKeys keys) const {
    const auto view = slot_.load();
    if (!view)
        return makeError(ErrorCode::noAccount);
    const Url plain = standardized(url);
    if (!plain.isFile() || !view->relative(plain.path()))
        return notInStore(url);
    if (const Result<FileAttributes> attributes = attributesAt(plain.path()))
        return readLocalAttributes(plain, *attributes, view.get(), keys);
    const std::optional<FoundSidecar> promise = promiseFor(*view, plain.path());
    if (!promise || !view->reader)
        return notInStore(url);
    const std::optional<ItemState> state =
        view->reader->ask([&](StateQueries& queries) { return queries.state(promise->mark.item); });
    if (!state || !state->remote)
        return notInStore(url);
    return readPromisedAttributes(plain, *state->remote, keys);
}

Result<ResourceValues> StoreDocuments::plainAttributes(const Url& url, ResourceKeys keys) const {
    const Result<FileAttributes> attributes = attributesAt(url.path());
    if (!attributes)
        return attributes.error();
    const auto view = slot_.load();
    const bool inside = view && view->relative(url.path());
    return readLocalAttributes(url, *attributes, inside ? view.get() : nullptr, keys);
}

std::optional<Url> StoreDocuments::physicalURL(const Url& url) const {
    if (standsAt(url.path()))
        return url;
    const auto view = slot_.load();
    if (!view || !view->relative(url.path()))
        return std::nullopt;
    const std::optional<FoundSidecar> promise = promiseFor(*view, url.path());
    return promise ? std::optional(Url::file(promise->path)) : std::nullopt;
}

bool StoreDocuments::isPromiseAtURL(const Url& url) const {
    return logicalURLOfPromise(url).has_value();
}

std::optional<Url> StoreDocuments::logicalURLOfPromise(const Url& promise) const {
    const auto view = slot_.load();
    if (!view || !hasSidecarForm(promise.lastPathComponent()) || !view->relative(promise.path()))
        return std::nullopt;
    const std::optional<SidecarMark> mark = readMark(promise.path(), view->mark);
    const std::optional<Url> folder = promise.deletingLastPathComponent();
    if (!mark || !folder)
        return std::nullopt;
    return folder->appending(promisedName(promise.lastPathComponent(), *mark));
}

bool StoreDocuments::isPromised(const Url& url) const {
    const auto view = slot_.load();
    if (!view || !view->relative(url.path()))
        return false;
    const Result<FileAttributes> attributes = FileManager::attributes(url.path(), FollowLinks::no);
    if (!attributes)
        return promiseFor(*view, url.path()).has_value();
    return attributes->kind == FileKind::directory && isPackageFolder(url) &&
           containsPromise(url.path(), view->mark);
}

bool StoreDocuments::isExternalDocumentReference(const Url& url) const {
    const auto view = slot_.load();
    return view && leavesContainer(*view, url);
}

Result<Url> StoreDocuments::resolveExternalDocumentReference(const Url& url) const {
    const auto view = slot_.load();
    if (!view)
        return makeError(ErrorCode::noAccount);
    return resolveReference(*view, url);
}

std::vector<std::string> StoreDocuments::tags(const Url& url) const {
    if (const std::optional<std::string> text = extendedAttribute(url.path(), "user.xdg.tags"))
        return tagsOf(*text);
    const auto view = slot_.load();
    if (!view || !view->reader || !view->relative(url.path()) || standsAt(url.path()))
        return {};
    const std::optional<FoundSidecar> promise = promiseFor(*view, url.path());
    if (!promise)
        return {};
    const std::optional<ItemState> state =
        view->reader->ask([&](StateQueries& queries) { return queries.state(promise->mark.item); });
    return state && state->remote ? tagsOf(state->remote->tags) : std::vector<std::string>();
}

} // namespace platform
