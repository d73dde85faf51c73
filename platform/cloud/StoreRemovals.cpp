#include "platform/cloud/StoreRemovals.h"

#include "platform/base/Text.h"
#include "platform/cloud/ContainerSet.h"
#include "platform/cloud/KeptFolder.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/files/PathText.h"

#include <map>

namespace platform {
namespace {

/// The content is the one that was agreed on with the remote.
bool isSent(const ItemState& state, const FileAttributes& attributes) {
    return state.base && !state.base->hash.empty() && !state.base->etag.empty() && state.local &&
           !state.local->promise && state.local->identity == attributes.identity &&
           state.local->size == attributes.size && state.local->modified == attributes.modified;
}

} // namespace

bool StoreRemovals::isFixed(std::string_view relative) {
    return relative.empty() || relative == defaultContainerFolder || relative == ".pelmora-root";
}

Failure StoreRemovals::remove(const std::string& relative) {
    if (isFixed(relative))
        return makeErrorWithText(
            ErrorCode::unsupportedOperation,
            localizedFormat("“%1$@” belongs to the store itself and cannot be deleted.",
                            nameOf(context_.pathOf(relative))));
    const std::string path = context_.pathOf(relative);
    const Result<FileAttributes> attributes = context_.disk.attributes(path);
    if (!attributes && !attributes.error().is(ErrorCode::noSuchItem))
        return attributes.error();
    const std::optional<FoundSidecar> promise =
        findSidecar(std::string(folderOf(path)), nameOf(path), context_.mark);
    if (!attributes && !promise)
        return attributes.error();
    std::optional<ItemId> item = context_.database.itemAtPath(relative);
    if (attributes) {
        const Result<std::string> kept =
            KeptFolder(context_).take(relative, holdsUnsent(relative, *attributes));
        if (!kept)
            return kept.error();
    }
    if (promise) {
        if (Failure failure = context_.disk.removeFile(promise->path))
            return namedForPeople(*failure, nameOf(relative));
        // The sidecar of a copied promise says less of the place than the record does.
        if (!item && context_.database.pathOf(promise->mark.item) == relative)
            item = promise->mark.item;
    }
    if (!item)
        return context_.database.takeFault();
    return context_.database.transaction([&]() -> Failure {
        context_.database.forgetLocalTree(*item);
        return std::nullopt;
    });
}

bool StoreRemovals::holdsUnsent(const std::string& relative, const FileAttributes& attributes) {
    const std::optional<ItemId> item = context_.database.itemAtPath(relative);
    if (!item)
        return attributes.kind != FileKind::symbolicLink;
    if (attributes.kind == FileKind::directory)
        return isUnsent(*item, context_.pathOf(relative));
    const std::optional<ItemState> state = context_.database.state(*item);
    return attributes.kind == FileKind::file && !(state && isSent(*state, attributes));
}

bool StoreRemovals::isUnsent(ItemId folder, const std::string& path) {
    const Result<std::vector<DirectoryEntry>> entries = context_.disk.entries(path);
    if (!entries)
        return true;
    std::map<std::string, ItemState> known;
    for (ItemState& state : context_.database.childrenOf(folder))
        if (state.item.place && state.item.place->parent == folder)
            known.emplace(state.item.place->name, std::move(state));
    for (const DirectoryEntry& entry : *entries) {
        const std::string inner = path + '/' + entry.name;
        const Result<FileAttributes> attributes = context_.disk.attributes(inner);
        if (!attributes)
            return true;
        if (attributes->kind == FileKind::file && hasSidecarForm(entry.name) &&
            readMark(inner, context_.mark))
            continue;
        const auto state = known.find(entry.name);
        if (attributes->kind == FileKind::directory
                ? state == known.end() || isUnsent(state->second.item.id, inner)
                : attributes->kind == FileKind::file &&
                      (state == known.end() || !isSent(state->second, *attributes)))
            return true;
    }
    return false;
}

} // namespace platform
