#include "platform/cloud/StoreDocuments.h"
#include "platform/cloud/StoreEngine.h"
#include "platform/files/FileCoordinator.h"

namespace platform {

Failure StoreDocuments::moveItem(const Url& source, const Url& to) {
    const std::shared_ptr<StoreEngine> engine = engine_();
    return engine && (isInShelfroot(source) || isInShelfroot(to))
               ? engine->moveItem(source, to)
               : FileManager::moveItem(source, to);
}

Failure StoreDocuments::removeItem(const Url& item) {
    const std::shared_ptr<StoreEngine> engine = engine_();
    return engine && isInShelfroot(item) ? engine->removeItem(item) : FileManager::removeItem(item);
}

Failure StoreDocuments::evictItem(const Url& item) {
    const std::shared_ptr<StoreEngine> engine = engine_();
    if (!engine)
        return makeError(ErrorCode::noAccount);
    if (isPromised(item) && !FileManager::exists(item.path()))
        return std::nullopt;
    FileCoordinator coordinator;
    Failure evicting;
    Failure refused =
        coordinator.coordinateWriting(item, WritingOptions::forReplacing,
                                      [&](const Url& url) { evicting = engine->evictItem(url); });
    return refused ? refused : evicting;
}

Failure StoreDocuments::deleteAllContentsOnClientAndServer(const CloudContainer& container) {
    const std::shared_ptr<StoreEngine> engine = engine_();
    return engine ? engine->deleteContainer(container) : Failure(makeError(ErrorCode::noAccount));
}

} // namespace platform
