#include "platform/documents/targets/TargetRules.h"

#include "platform/base/Text.h"
#include "platform/cloud/CloudDocumentService.h"
#include "platform/documents/DisplayName.h"
#include "platform/documents/FolderPath.h"
#include "platform/documents/targets/MovedItems.h"
#include "platform/launch/TypeRegistry.h"

#include <algorithm>

namespace platform {
namespace {

bool isFamilyOf(const Value& contents, std::string_view type) {
    const std::string* const family = contents.text();
    return family && (*family == types::data || *family == types::content ||
                      TypeRegistry::conformsTo(type, *family));
}

/// A document without an extension, or with one that says nothing, suits any container.
bool takes(const CloudContainer& container, std::string_view extension) {
    if (container.isDefault() || container.documentTypes().empty())
        return true;
    const auto type = TypeRegistry::preferredIdentifierForExtension(extension);
    if (!type)
        return true;
    return std::ranges::any_of(container.documentTypes(), [&](const ContainerDocumentType& kind) {
        const Value::List* const contents = kind.contentTypes.list();
        return contents && std::ranges::any_of(*contents, [&](const Value& each) {
                   return isFamilyOf(each, *type);
               });
    });
}

enum class FolderRule { all, firstLevel, none };

/// A level that this version does not know allows nothing: what breaks a container's rule may be
/// lost to its application.
FolderRule ruleOf(const CloudContainer& container) {
    const std::optional<int> levels = container.supportedFolderLevels();
    if (!levels || *levels == static_cast<int>(FolderLevels::any))
        return FolderRule::all;
    return *levels == static_cast<int>(FolderLevels::one) ? FolderRule::firstLevel
                                                          : FolderRule::none;
}

std::optional<std::string> whyNoFolders(const CloudContainer& container, std::size_t depth,
                                        const MovedItems& items) {
    const FolderRule rule = ruleOf(container);
    if (rule == FolderRule::all || !items.haveFolders())
        return std::nullopt;
    const std::string name = displayName(container.localizedName());
    if (rule == FolderRule::none)
        return localizedFormat("“%1$@” does not take folders.", name);
    if (depth > 0 || items.haveNestedFolders())
        return localizedFormat("“%1$@” does not take folders within folders.", name);
    return std::nullopt;
}

std::optional<std::string> whyNotTheseDocuments(const CloudContainer& container,
                                                const MovedItems& items) {
    const auto refused = [&](const std::string& extension) { return !takes(container, extension); };
    const auto& extensions = items.extensions();
    if (std::ranges::none_of(extensions, refused))
        return std::nullopt;
    const std::string name = displayName(container.localizedName());
    if (items.count() == 1)
        return localizedFormat("“%1$@” does not take documents of this kind.", name);
    return localizedFormat("“%1$@” does not take all of these documents.", name);
}

} // namespace

std::optional<std::string> whyNotInto(const Url& folder, const MovedItems& items,
                                      const CloudDocumentService& documents) {
    if (documents.shelfroot() == folder)
        return localized("Open the folder into which to move.");
    const auto container = documents.containerForItemAtURL(folder);
    const std::optional<std::size_t> depth = folderDepth(folder, documents);
    if (!container || !*container || !depth)
        return localized("This folder does not take documents.");
    if (items.reachInto(folder))
        return localized("A folder cannot be moved into itself.");
    if (items.areAllIn(folder))
        return items.count() == 1 ? localizedFormat("“%1$@” is here already.", items.title())
                                  : localized("These items are here already.");
    if (auto reason = whyNoFolders(**container, *depth, items))
        return reason;
    return whyNotTheseDocuments(**container, items);
}

bool mayHoldNewFolder(const Url& folder, const CloudDocumentService& documents) {
    const auto container = documents.containerForItemAtURL(folder);
    const std::optional<std::size_t> depth = folderDepth(folder, documents);
    if (!container || !*container || !depth)
        return false;
    const FolderRule rule = ruleOf(**container);
    return rule == FolderRule::all || (rule == FolderRule::firstLevel && *depth == 0);
}

} // namespace platform
