#pragma once

#include "platform/cloud/CloudDocumentService.h"
#include "platform/cloud/StoreView.h"

#include <functional>
#include <memory>

namespace platform {

class StoreEngine;

/// Answers from the disk, from memory and, for promises alone, from the state database; changes are
/// the engine's.
class StoreDocuments final : public CloudDocumentService {
public:
    using CurrentEngine = std::function<std::shared_ptr<StoreEngine>()>;
    StoreDocuments(const StoreViewSlot& slot, CurrentEngine engine)
        : slot_(slot), engine_(std::move(engine)) {}

    std::optional<Url> shelfroot() const override;
    bool isInShelfroot(const Url& url) const override;
    bool isDocumentsContainer(const Url& url) const override;
    std::optional<std::string> pathRelativeToShelfroot(const Url& url) const override;

    Result<std::shared_ptr<const CloudContainer>>
    containerForItemAtURL(const Url& url) const override;
    std::vector<std::shared_ptr<const CloudContainer>> containers() const override;
    std::string localizedNameForDefaultContainer() const override;
    std::optional<Url> defaultContainerURL() const override;

    Result<ResourceValues> promisedItemAttributes(const Url& url, ResourceKeys keys) const override;
    Result<ResourceValues> plainAttributes(const Url& url, ResourceKeys keys) const override;

    std::optional<Url> physicalURL(const Url& url) const override;
    bool isPromiseAtURL(const Url& url) const override;
    std::optional<Url> logicalURLOfPromise(const Url& promise) const override;
    bool isPromised(const Url& url) const override;

    bool isExternalDocumentReference(const Url& url) const override;
    Result<Url> resolveExternalDocumentReference(const Url& url) const override;

    std::vector<std::string> tags(const Url& url) const override;

    [[nodiscard]] Failure moveItem(const Url& source, const Url& to) override;
    [[nodiscard]] Failure removeItem(const Url& item) override;
    [[nodiscard]] Failure evictItem(const Url& item) override;
    [[nodiscard]] Failure
    deleteAllContentsOnClientAndServer(const CloudContainer& container) override;

private:
    /// The mark of the promise for the document at `path`, when nothing stands there.
    std::optional<FoundSidecar> promiseFor(const StoreView& view, std::string_view path) const;

    const StoreViewSlot& slot_;
    const CurrentEngine engine_;
};

} // namespace platform
