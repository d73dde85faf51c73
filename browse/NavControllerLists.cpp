#include "app/Settings.h"
#include "app/VXLogging.h"
#include "browse/LaunchUtils.h"
#include "browse/NavController.h"
#include "items/FileUtils.h"
#include "items/UrlExtensions.h"
#include "platform/Platform.h"
#include "platform/documents/DocumentSearchController.h"
#include "preview/PreviewItemManager.h"

#include <limits>

namespace tavrin {
namespace {

using platform::ResourceKey;
using platform::Url;

/// Delete, more and information; renaming is added to what the list then offers.
constexpr unsigned basicActions = 7;
constexpr unsigned renameAction = 1U << static_cast<unsigned>(platform::DocumentAction::rename);

/// The count logged last, by whichever list; at first none that a list can have.
std::size_t lastLoggedCount = std::numeric_limits<std::size_t>::max();

/// What only the platform knows of the list's folder, for the log.
platform::Value valueOf(const Url& url, ResourceKey key) {
    return FileUtils::getResourceValue(key, url);
}

} // namespace

void NavController::initNewListController(List& list) {
    viewTitle_ = list.title();
    const Url& url = list.presentedURL();
    VXLOG(vxDebug, "DLC title: %@", list.title());
    VXLOG(vxDebug, "DLC URL: %@", url);
    VXLOG(vxDebug, "DLC Name: %@", valueOf(url, ResourceKey::localizedName));
    VXLOG(vxDebug, "DLC UTI: %@", valueOf(url, ResourceKey::typeIdentifier));
    VXLOG(vxDebug, "DLC Type: %@", valueOf(url, ResourceKey::localizedTypeDescription));
    VXLOG(vxDebug, "DLC has %d items: %@", list.containedItemCount(), list.containedItems());
    list.setAvailableActions(basicActions);
    list.setAvailableActions(list.availableActions() | renameAction);
    configureNavBar(list);
    if (list.title().empty())
        VXLOG(vxWarning, "Warning: newList title not set");
    list.view()->setBackgroundColor(Settings::backgroundColor());
    configureToolbar(list);
    list.setDelegate(std::weak_ptr<platform::DocumentListControllerDelegate>(self()));
}

void NavController::documentListControllerDidSelectContainerWithViewController(
    List& /*list*/, const ListPointer& next) {
    if (editMode_) {
        VXLOG(vxWarning, "DLC Navigation not allowed while in edit mode");
        return;
    }
    if (leaveSearchForFolder(next))
        return;
    initNewListController(*next);
    pushViewController(next, true);
}

bool NavController::leaveSearch() {
    if (!std::dynamic_pointer_cast<platform::DocumentSearchController>(presentedViewController()))
        return false;
    dismissViewController(true);
    return true;
}

bool NavController::leaveSearchForFolder(const ListPointer& next) {
    if (!leaveSearch())
        return false;
    const auto lists = List::listControllerHierarchyForURL(next->presentedURL());
    if (!lists) {
        VXLOG(vxError, "Search folder tap: Couldn't build DLC stack for %@.", next->presentedURL());
        return false;
    }
    setViewControllers({lists->begin(), lists->end()}, false);
    return true;
}

void NavController::documentListControllerDidSelectItemAtURL(List& /*list*/, const Url& url) {
    VXLOG(vxDebug, "Picked URL: %@", url);
    const auto item = std::make_shared<VXItem>(url);
    if (editMode_) {
        VXLOG(vxDebug, "DLC Selection not allowed while in edit mode");
        return;
    }
    LaunchUtils::openInDefaultApp(url, true, [this, &item](bool launched) {
        if (launched) {
            VXLOG(vxDebug, "openInDefaultApp returned YES, app launched");
            return;
        }
        VXLOG(vxDebug, "openInDefaultApp returned NO, showing preview");
        platform::Platform::current().mainQueue().async([weak = weak_from_this(), item] {
            if (const auto screen = std::static_pointer_cast<NavController>(weak.lock()))
                screen->showPreview(item, fullPreviewMode);
        });
    });
}

void NavController::documentListControllerItemsChanged(List& list) {
    pickerIsAlive_ = true;
    if (getTopDocumentListController().get() != &list)
        return;
    if (editMode_) {
        VXLOG(vxDebug, "DLC selected item count is %@", list.selectedItemCount());
    } else if (list.containedItemCount() != lastLoggedCount) {
        lastLoggedCount = list.containedItemCount();
        VXLOG(vxDebug, "DLC items changed, count is %@", lastLoggedCount);
    }
    updateStatusUI(&list);
}

void NavController::documentListControllerPerformAction(
    List& list, int action, const Url& url, const std::shared_ptr<platform::View>& originatingView,
    std::function<void()> completion) {
    switch (action) {
    case static_cast<int>(platform::DocumentAction::remove):
        showWarningAndDeleteURLs({url}, originatingView, nullptr, std::move(completion));
        break;
    case static_cast<int>(platform::DocumentAction::more):
        showActionsMenuFromView(originatingView, url, list.presentedURL(), std::move(completion));
        break;
    case static_cast<int>(platform::DocumentAction::information):
        showPreview(std::make_shared<VXItem>(url), detailsMode);
        completion();
        break;
    case static_cast<int>(platform::DocumentAction::rename):
        VXLOG(vxInfo, "Rename action: %@", url);
        showRenamePrompt(url);
        completion();
        break;
    default:
        VXLOG(vxWarning, "performAction:%@ -- unexpected value", action);
        completion();
        break;
    }
}

void NavController::documentListControllerPerformAction(List& list, int action, const Url& url) {
    documentListControllerPerformAction(list, action, url, view(), [] {});
}

bool NavController::showURLPreview(const std::optional<Url>& url, int previewMode) {
    if (!url)
        return false;
    if (!dossa_isInShelfroot(*url)) {
        VXLOG(vxDebug, "Preview URL is not in the Shelfroot dir: %@", *url);
        return false;
    }
    const std::optional<Url> folder =
        FileUtils::isDir(*url) ? url : url->deletingLastPathComponent();
    if (!folder) {
        VXLOG(vxError, "Can't get directory for %@. Not previewing", *url);
        return false;
    }
    VXLOG(vxDebug, "Building DLC stack for %@", *folder);
    const auto lists = List::listControllerHierarchyForURL(*folder);
    if (!lists) {
        VXLOG(vxError, "Couldn't build DLC stack for %@. Not previewing", *folder);
        return false;
    }
    // It would cover what is shown now.
    leaveSearch();
    std::vector<std::shared_ptr<ViewController>> stack(lists->begin(), lists->end());
    const std::shared_ptr<PreviewItemManager> manager = startItemManager(previewMode);
    if (const auto screen = manager->prepareToPreviewItem(std::make_shared<VXItem>(*url))) {
        stack.push_back(screen);
        setViewControllers(std::move(stack), true);
        manager->finishPreviewingItem();
    } else {
        setViewControllers(std::move(stack), true);
    }
    return true;
}

} // namespace tavrin
