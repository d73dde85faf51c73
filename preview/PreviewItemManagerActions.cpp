#include "app/VXLogging.h"
#include "items/FileUtils.h"
#include "items/UIUtils.h"
#include "preview/PreviewItemManager.h"

namespace tavrin {

using platform::Failure;
using platform::Url;

void PreviewItemManager::showMoveTarget(platform::ViewController& asking) {
    VXLOG(vxInfo, "Pressed Move");
    const std::optional<Url> url = itemUrl();
    if (!url)
        return;
    const auto chooser = platform::DocumentTargetSelectionController::create({*url});
    chooser->setDelegate(
        std::weak_ptr<platform::DocumentTargetSelectionControllerDelegate>(shared_from_this()));
    chooser->setModalPresentationStyle(platform::PresentationStyle::overCurrentContext);
    if (platform::NavigationController* stack = asking.navigationController())
        stack->presentViewController(chooser, true, [] { VXLOG(vxDebug, "Presented moveTarget"); });
}

void PreviewItemManager::documentTargetSelectionControllerDidSelectItemAtURL(
    platform::DocumentTargetSelectionController& chooser, const Url& folder) {
    const std::vector<Url> items = chooser.itemsToMove();
    VXLOG(vxDebug, "MoveTarget = %@", folder);
    VXLOG(vxDebug, "ItemsToMove = %@", items);
    chooser.dismissViewController(true);
    for (const Url& item : items) {
        const Failure failure = FileUtils::move(item, folder.appending(item.lastPathComponent()));
        const auto navigation = navigationController();
        if (failure && navigation)
            UIUtils::showError(failure, navigation->topViewController());
    }
}

void PreviewItemManager::showWarningAndDeleteDocument(
    const Screen& asking, const platform::BarButtonItem::Pointer& barButton) {
    const std::optional<Url> url = itemUrl();
    if (!url)
        return;
    // Strong on purpose: popping the screen makes the owner drop this object.
    UIUtils::showDeleteWarningAlert(
        {*url}, false, asking, nullptr, barButton,
        [manager = shared_from_this(), asking](const platform::AlertAction*, bool cancelled) {
            const std::optional<Url> deleted = manager->itemUrl();
            if (cancelled || !deleted)
                return;
            if (platform::NavigationController* stack = asking->navigationController())
                stack->popViewController(true);
            if (const Failure failure = FileUtils::remove(*deleted))
                UIUtils::showError(failure, asking);
        });
}

} // namespace tavrin
