#pragma once

#include "platform/cloud/CloudContainer.h"
#include "platform/cloud/ItemAttributes.h"

#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace platform {

/// Questions about the items of the store and the changes that need to know of promises. All reads
/// answer from the disk and from memory at once and are safe from any thread.
class CloudDocumentService {
public:
    virtual ~CloudDocumentService() = default;

    /// The directory of all cloud documents ("Shelfroot"); none without an account.
    virtual std::optional<Url> shelfroot() const = 0;
    virtual bool isInShelfroot(const Url& url) const = 0;
    /// The URL is the documents root of a container.
    virtual bool isDocumentsContainer(const Url& url) const = 0;
    /// The path relative to Shelfroot without a leading slash; none outside it.
    virtual std::optional<std::string> pathRelativeToShelfroot(const Url& url) const = 0;

    /// The container that holds the item (or is it).
    virtual Result<std::shared_ptr<const CloudContainer>>
    containerForItemAtURL(const Url& url) const = 0;
    virtual std::vector<std::shared_ptr<const CloudContainer>> containers() const = 0;
    virtual std::string localizedNameForDefaultContainer() const = 0;
    /// Local URL of the default container's documents; none without an account.
    virtual std::optional<Url> defaultContainerURL() const = 0;

    /// What is known of a document, also when only its placeholder is on the device. Fails for an
    /// item that the store does not know; then plainAttributes may still answer.
    virtual Result<ResourceValues> promisedItemAttributes(const Url& url,
                                                          ResourceKeys keys) const = 0;
    /// What the file system says of what stands at the URL.
    virtual Result<ResourceValues> plainAttributes(const Url& url, ResourceKeys keys) const = 0;

    /// Where the document's bytes, or its placeholder, lie; none when neither is there.
    virtual std::optional<Url> physicalURL(const Url& url) const = 0;
    /// A placeholder lies at exactly this URL.
    virtual bool isPromiseAtURL(const Url& url) const = 0;
    /// The document that the placeholder at this URL promises.
    virtual std::optional<Url> logicalURLOfPromise(const Url& promise) const = 0;
    /// The document at this (logical) URL is only promised.
    virtual bool isPromised(const Url& url) const = 0;

    virtual bool isExternalDocumentReference(const Url& url) const = 0;
    virtual Result<Url> resolveExternalDocumentReference(const Url& url) const = 0;

    /// Tag names; empty when the item has none.
    virtual std::vector<std::string> tags(const Url& url) const = 0;

    // Changes: blocking, from any thread but a queue that somebody here waits for. The first two do
    // not coordinate: whoever calls them does. Items outside the store are treated as plain files.

    /// Moves a document, a promise (with its sidecar) or a folder. Never replaces: fileExists when
    /// something stands, or is promised, at `to`.
    [[nodiscard]] virtual Failure moveItem(const Url& source, const Url& to) = 0;
    /// Deletes a document, a promise, or a folder with all in it. Local content goes to the store's
    /// kept folder; see docs/store.md.
    [[nodiscard]] virtual Failure removeItem(const Url& item) = 0;
    /// Leaves of the document on this device but a promise. Refused with notUploadedYet while the
    /// account is not known to have the content, byte for byte, and when the account cannot be
    /// asked. Success when it is a promise already. Coordinates the change itself.
    [[nodiscard]] virtual Failure evictItem(const Url& item) = 0;
    /// Deletes a library here and on the account, recoverably on both; coordinates the change
    /// itself. Nothing is changed when the account cannot be read. Another error tells that a part
    /// is still on the account.
    [[nodiscard]] virtual Failure
    deleteAllContentsOnClientAndServer(const CloudContainer& container) = 0;

    /// Security-scoped access, for stores that need it; answers whether it was granted.
    virtual bool startAccessing(const Url& /*url*/) { return false; }
    virtual void stopAccessing(const Url& /*url*/) {}
};

} // namespace platform
