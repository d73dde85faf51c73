#include "items/UrlExtensions.h"

#include "platform/Platform.h"
#include "platform/cloud/CloudDocumentService.h"

namespace tavrin {

using platform::Platform;

std::optional<platform::Url> tavrin_URLByResolvingBookmark(const platform::Url& url) {
    if (!Platform::current().documents().isExternalDocumentReference(url))
        return std::nullopt;
    const platform::Result<platform::Url> target =
        Platform::current().documents().resolveExternalDocumentReference(url);
    if (!target)
        return std::nullopt;
    if (std::optional<platform::Url> promised = tavrin_URLByResolvingPromise(*target))
        return promised;
    return *target;
}

std::optional<platform::Url> tavrin_URLByResolvingPromise(const platform::Url& url) {
    if (!Platform::current().documents().isPromiseAtURL(url))
        return std::nullopt;
    const std::optional<platform::Url> logical =
        Platform::current().documents().logicalURLOfPromise(url);
    if (!logical)
        return std::nullopt;
    return logical->withPhysicalUrl(url);
}

bool wantsDefaultMediaPlayer(const platform::Url& /*url*/) {
    return true;
}

bool dossa_isDocumentsContainer(const platform::Url& url) {
    return Platform::current().documents().isDocumentsContainer(url);
}

bool dossa_isInShelfroot(const platform::Url& url) {
    return Platform::current().documents().isInShelfroot(url);
}

} // namespace tavrin
