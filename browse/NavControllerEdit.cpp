#include "app/VXLogging.h"
#include "browse/DocumentListControllerStatusBar.h"
#include "browse/NavController.h"
#include "items/FileUtils.h"
#include "items/UrlExtensions.h"
#include "platform/Platform.h"
#include "platform/base/Text.h"
#include "platform/cloud/CloudContainer.h"
#include "platform/cloud/CloudDocumentService.h"
#include "platform/ui/Controls.h"

#include <algorithm>
#include <utility>

namespace tavrin {
namespace {

using platform::BarButtonItem;
using platform::FolderLevels;
using platform::localized;
using platform::Url;

bool depthRuleAllows(const platform::CloudContainer& container, std::size_t depth) {
    const std::string& name = container.identifier();
    const std::optional<int> levels = container.supportedFolderLevels();
    if (!levels) {
        VXLOG(vxDebug, "Container %@ has no depth. Enabling new folder button", name);
        return true;
    }
    switch (*levels) {
    case static_cast<int>(FolderLevels::none):
        VXLOG(vxDebug, "Container %@ supports no folders. Disabling new folder button", name);
        return false;
    case static_cast<int>(FolderLevels::any):
        VXLOG(vxDebug, "Container %@ supports any folder. Enabling new folder button", name);
        return true;
    case static_cast<int>(FolderLevels::one):
        if (depth == 0) {
            VXLOG(vxDebug,
                  "Container %@ supports one folder. File is depth 0. Enabling new folder button",
                  name);
            return true;
        }
        VXLOG(vxDebug,
              "Container %@ supports one folder. File is depth %u. Disabling new folder button",
              name, depth);
        return false;
    default:
        VXLOG(vxWarning, "Container %@ has unknown depth option %@. Disabling new folder button",
              name, *levels);
        return false;
    }
}

} // namespace

void NavController::beginEditMode() {
    VXLOG(vxInfo, "Begin Edit mode");
    if (const ListPointer list = getTopDocumentListController())
        setEditModeAndUpdateUI(true, *list);
}

void NavController::endEditMode() {
    const ListPointer list = getTopDocumentListController();
    if (!list)
        return;
    VXLOG(vxDebug, "EndEditMode.  Selected %d items: %@", list->selectedItemCount(),
          list->selectedItems());
    setEditModeAndUpdateUI(false, *list);
}

void NavController::selectAllItems() {
    VXLOG(vxInfo, "Pressed SelectAll");
    const ListPointer list = getTopDocumentListController();
    if (!list)
        return;
    VXLOG(vxDebug, "DLC has %d contained items", list->containedItemCount());
    list->setSelectedItems(list->containedItems());
    VXLOG(vxDebug, "Selected all %d: %@", list->selectedItemCount(), list->selectedItems());
}

void NavController::setEditModeAndUpdateUI(bool editing, List& forViewController) {
    editMode_ = editing;
    forViewController.setEditing(editing, true);
    configureVisibleControllerForMode();
    if (editMode_ && barButtonNewFolder_)
        barButtonNewFolder_->setEnabled(canEnableNewFolderForSelectedItems(forViewController));
}

void NavController::configureVisibleControllerForMode() {
    const ListPointer list = getTopDocumentListController();
    if (!list)
        return;
    configureNavBar(*list);
    configureToolbar(*list);
    updateStatusUI(list.get());
}

void NavController::configureNavBar(List& list) {
    platform::NavigationItem& item = list.navigationItem();
    const auto weak = weak_from_this();
    const auto calling = [weak](void (NavController::*operation)()) {
        return [weak, operation](BarButtonItem&) {
            if (const auto screen = std::static_pointer_cast<NavController>(weak.lock()))
                ((*screen).*operation)();
        };
    };
    if (editMode_) {
        item.setRightBarButtonItem(BarButtonItem::withSystemItem(
            platform::SystemItem::cancel, calling(&NavController::endEditMode)));
        item.setTitle(localized("Select Items"));
    } else {
        std::vector<BarButtonItem::Pointer> items{
            BarButtonItem::withTitle(localized("Select"), platform::BarStyle::plain,
                                     calling(&NavController::beginEditMode))};
        if (platform::Platform::current().documents().shelfroot() == list.presentedURL())
            items.push_back(makeAccountButton());
        item.setRightBarButtonItems(std::move(items));
        item.setTitle(viewTitle_);
    }
    item.setHidesBackButton(editMode_, false);
}

BarButtonItem::Pointer NavController::makeEditButton(std::string_view title,
                                                     void (NavController::*action)()) {
    const auto button = std::make_shared<platform::Button>(platform::ButtonType::system);
    button->setTitle(title);
    button->addAction(platform::ControlEvent::touchUpInside, [weak = weak_from_this(), action] {
        if (const auto screen = std::static_pointer_cast<NavController>(weak.lock()))
            ((*screen).*action)();
    });
    button->sizeToFit();
    return BarButtonItem::withCustomView(button);
}

void NavController::configureToolbar(List& list) {
    const BarButtonItem::Pointer formerNewFolder = std::exchange(barButtonNewFolder_, nullptr);
    barButtonMoveItem_.reset();
    barButtonDeleteItem_.reset();
    if (!editMode_) {
        if (!statusBar(list))
            createStatusBar(list);
        displayStatusBar(list);
        updateStatusUI(&list);
        return;
    }
    barButtonNewFolder_ =
        makeEditButton(localized("New Folder"), &NavController::promtForNewFolderAndCreate);
    // The list has come back to the top in edit mode: the button is as it was.
    if (formerNewFolder)
        barButtonNewFolder_->setEnabled(formerNewFolder->isEnabled());
    barButtonMoveItem_ =
        makeEditButton(localized("Move"), &NavController::showMoveTargetForSelectedItems);
    barButtonDeleteItem_ =
        makeEditButton(localized("Delete"), &NavController::showWarningAndDeleteDocument);
    const auto space = BarButtonItem::withSystemItem(platform::SystemItem::flexibleSpace);
    list.setToolbarItems(
        {barButtonNewFolder_, space, barButtonMoveItem_, space, barButtonDeleteItem_});
}

void NavController::updateStatusUI(List* list) {
    if (!pickerIsAlive_)
        return;
    ListPointer top;
    if (!list) {
        top = getTopDocumentListController();
        list = top.get();
        if (!list)
            return;
    }
    if (const auto bar = statusBar(*list)) {
        bar->statusLabel()->setText(toolbarStatusText(list->containedItemCount()));
        bar->statusLabel()->sizeToFit();
    }
    if (!editMode_)
        return;
    const std::size_t selected = list->selectedItemCount();
    list->navigationItem().setTitle(
        selected > 0
            ? platform::localizedPlural(".DICT.ITEMS_SELECTED.%d", static_cast<long long>(selected))
            : localized("Select Items"));
    if (barButtonMoveItem_)
        barButtonMoveItem_->setEnabled(canShowMoveForSelectedItems(*list));
    if (barButtonDeleteItem_)
        barButtonDeleteItem_->setEnabled(canShowDeleteForSelectedItems(*list));
}

std::size_t NavController::numContainersInURLArray(const Urls& urls) {
    return static_cast<std::size_t>(
        std::count_if(urls.begin(), urls.end(), dossa_isDocumentsContainer));
}

bool NavController::canShowMoveForSelectedItems(const List& list) {
    return list.selectedItemCount() > 0 && list.selectedContainerCount() == 0;
}

bool NavController::canShowDeleteForSelectedItems(const List& list) {
    const std::size_t selected = list.selectedItemCount();
    const std::size_t containers = list.selectedContainerCount();
    return selected > 0 && (containers == 0 || containers == selected);
}

bool NavController::canEnableNewFolderForSelectedItems(const List& list) {
    std::shared_ptr<const platform::CloudContainer> container;
    std::vector<std::string> path;
    const platform::Failure failure =
        FileUtils::containerAndRelativePathforURL(list.presentedURL(), &container, &path);
    if (failure || !container) {
        VXLOG(vxError, "Couldn't get container for URL %@: %@", list.presentedURL(), failure);
        return false;
    }
    return depthRuleAllows(*container, path.size());
}

void NavController::promtForNewFolderAndCreate() {
    VXLOG(vxInfo, "Pressed NewFolder");
    if (const ListPointer list = getTopDocumentListController())
        showNewFolderPromptDuringMove(list->presentedURL(), std::nullopt);
}

} // namespace tavrin
