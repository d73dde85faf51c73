#include "app/VXLogging.h"
#include "browse/NavController.h"
#include "items/FileUtils.h"
#include "items/UIUtils.h"
#include "platform/base/Text.h"
#include "platform/cloud/CloudContainer.h"
#include "platform/files/FileManager.h"

namespace tavrin {
namespace {

using platform::Error;
using platform::localized;
using platform::localizedPlural;
using platform::Url;

std::string cannotMoveText(std::size_t count) {
    return localizedPlural(".DICT.CANNOT_MOVE_ITEMS.%d", static_cast<long long>(count));
}

/// The is-directory attribute of an entry; none (logged) when it cannot be read.
std::optional<bool> isDirectoryEntry(const Url& folder, const platform::DirectoryEntry& entry) {
    if (entry.kind == platform::FileKind::directory)
        return true;
    if (entry.kind == platform::FileKind::file)
        return false;
    const Url child = folder.appending(entry.name);
    const auto attributes =
        platform::FileManager::attributes(child.path(), platform::FollowLinks::no);
    if (!attributes) {
        VXLOG(vxInfo, "Error enumerating %@: %@", child, attributes.error());
        return std::nullopt;
    }
    return attributes->kind == platform::FileKind::directory;
}

/// Makes the folder that a prompt asked for; the words for what stands in its way.
FilenamePrompt::Text makeNewFolder(const Url& folder) {
    if (FileUtils::isTaken(folder)) {
        VXLOG(vxInfo, "Item exists at path: %@", folder.path());
        return UIUtils::bestMessage(
            platform::makeError(platform::ErrorCode::fileExists, folder.lastPathComponent()));
    }
    const platform::Failure failure = FileUtils::mkdir(folder);
    return failure ? FilenamePrompt::Text(UIUtils::bestMessage(failure)) : std::nullopt;
}

} // namespace

void NavController::showMoveTargetForSelectedItems() {
    VXLOG(vxInfo, "Pressed Move");
    const ListPointer list = getTopDocumentListController();
    if (!list)
        return;
    const Urls items = list->selectedItems();
    setEditModeAndUpdateUI(false, *list);
    showMoveTargetForItems(items, list->presentedURL());
}

void NavController::showMoveTargetForItems(const Urls& items, const Url& inFolder) {
    VXLOG(vxInfo, "Prompting for Move Target, %d items", items.size());
    if (!containerHasSubfolders(inFolder)) {
        showNewFolderPromptDuringMove(inFolder, items);
        return;
    }
    const auto chooser = platform::DocumentTargetSelectionController::create(items);
    chooser->setDelegate(
        std::weak_ptr<platform::DocumentTargetSelectionControllerDelegate>(self()));
    chooser->setModalPresentationStyle(platform::PresentationStyle::overCurrentContext);
    presentViewController(chooser, true, [] { VXLOG(vxDebug, "Presented moveTarget"); });
}

bool NavController::containerHasSubfolders(const Url& url) {
    std::shared_ptr<const platform::CloudContainer> container;
    if (FileUtils::containerAndRelativePathforURL(url, &container, nullptr) || !container)
        return true;
    if (!container->documentsURL())
        return false;
    const Url& folder = *container->documentsURL();
    bool found = false;
    const platform::Failure failure =
        platform::FileManager::enumerate(folder.path(), [&](const platform::DirectoryEntry& entry) {
            const bool hidden = entry.name.starts_with('.');
            found = !hidden && isDirectoryEntry(folder, entry).value_or(false);
            return !found;
        });
    if (failure)
        VXLOG(vxInfo, "Error enumerating %@: %@", folder, *failure);
    return found;
}

void NavController::documentTargetSelectionControllerDidSelectItemAtURL(
    platform::DocumentTargetSelectionController& chooser, const Url& folder) {
    // Copies: what is given belongs to the chooser, which may end with its dismissal.
    const Urls items = chooser.itemsToMove();
    const Url target = folder;
    dismissViewController(true);
    moveItemsToDirectoryAndShowErrors(items, target);
}

std::vector<Error> NavController::moveItemsToDirectory(const Urls& items, const Url& toDirectory) {
    VXLOG(vxDebug, "MoveTarget = %@", toDirectory);
    VXLOG(vxDebug, "ItemsToMove = %@", items);
    std::vector<Error> errors;
    for (const Url& item : items)
        if (platform::Failure failure =
                FileUtils::move(item, toDirectory.appending(item.lastPathComponent())))
            errors.push_back(std::move(*failure));
    return errors;
}

void NavController::moveItemsToDirectoryAndShowErrors(const Urls& items, const Url& toDirectory) {
    const std::vector<Error> errors = moveItemsToDirectory(items, toDirectory);
    if (errors.size() == 1)
        UIUtils::showError(errors.front(), topViewController());
    else if (!errors.empty())
        UIUtils::showAlert(cannotMoveText(errors.size()), "", topViewController());
}

void NavController::showNewFolderPromptDuringMove(const std::optional<Url>& folder,
                                                  const std::optional<Urls>& itemsToMove) {
    if (!folder) {
        VXLOG(vxWarning, "dlc.presentedURL is nil");
        return;
    }
    const std::string title =
        itemsToMove
            ? localizedPlural(".DICT.MOVE_ITEMS.%d", static_cast<long long>(itemsToMove->size()))
            : localized("New Folder");
    presentPrompt(NewFolderPrompt::newWithTitle(
        title, localized(itemsToMove ? "Move" : "Create"),
        [weak = weak_from_this(), folder = *folder, itemsToMove](
            const std::optional<std::string>& name, bool& dismiss) -> FilenamePrompt::Text {
            if (!name || name->empty())
                return std::nullopt;
            const Url made = folder.appending(*name, true);
            if (FilenamePrompt::Text trouble = makeNewFolder(made))
                return trouble;
            std::vector<Error> errors;
            if (itemsToMove && !weak.expired())
                errors = moveItemsToDirectory(*itemsToMove, made);
            dismiss = errors.empty();
            if (errors.empty())
                return std::nullopt;
            return errors.size() == 1 ? UIUtils::bestMessage(errors.front())
                                      : cannotMoveText(errors.size());
        }));
}

} // namespace tavrin
