#include "preview/GlimpseItemController.h"

#include "app/VXLogging.h"
#include "platform/Platform.h"
#include "platform/base/NotificationCenter.h"
#include "platform/ui/Application.h"
#include "preview/PreviewItemManager.h"

namespace tavrin {

using platform::BarButtonItem;
using platform::SystemItem;

const std::shared_ptr<GlimpseItemController>& GlimpseItemController::defaultController() {
    static std::shared_ptr<GlimpseItemController> shared;
    static platform::Observation willTerminate;
    if (!shared) {
        shared = create();
        willTerminate = platform::Platform::current().notifications().observe(
            platform::applicationWillTerminateNotification,
            [](const platform::Notification&) { shared.reset(); });
    }
    return shared;
}

std::shared_ptr<GlimpseItemController> GlimpseItemController::create() {
    std::shared_ptr<GlimpseItemController> controller(new GlimpseItemController());
    controller->init();
    return controller;
}

std::shared_ptr<GlimpseItemController>
GlimpseItemController::createWithItemManager(const std::shared_ptr<PreviewItemManager>& manager) {
    const std::shared_ptr<GlimpseItemController> controller = create();
    controller->takeManager(manager);
    return controller;
}

void GlimpseItemController::init() {
    PlatformPreviewController::setDelegate(this);
    setDataSource(this);
    const auto calling = [weak = weak_from_this()](void (GlimpseItemController::*operation)()) {
        return [weak, operation](BarButtonItem&) {
            if (const auto self = std::static_pointer_cast<GlimpseItemController>(weak.lock()))
                ((*self).*operation)();
        };
    };
    moveItem_ = BarButtonItem::withSystemItem(SystemItem::organize,
                                              calling(&GlimpseItemController::showMoveTarget));
    deleteItem_ = BarButtonItem::withSystemItem(
        SystemItem::trash, calling(&GlimpseItemController::showWarningAndDeleteDocument));
    setAdditionalRightBarButtonItems({deleteItem_, moveItem_});
}

void GlimpseItemController::takeManager(const std::shared_ptr<PreviewItemManager>& manager) {
    itemManager_ = manager;
    documents_.reset();
    const auto item = manager ? manager->item() : nullptr;
    if (item && item->resolvedURL())
        documents_ = {*item->resolvedURL()};
}

void GlimpseItemController::glimpseNewItem(const std::shared_ptr<PreviewItemManager>& manager) {
    takeManager(manager);
    reloadData();
}

bool GlimpseItemController::isVisible() {
    return isViewLoaded() && view()->window() != nullptr;
}

void GlimpseItemController::viewWillDisappear(bool animated) {
    if (const auto manager = itemManager())
        manager->viewControllerWillDisappear(*this);
    PlatformPreviewController::viewWillDisappear(animated);
}

std::size_t GlimpseItemController::numberOfPreviewItemsInPreviewController(
    platform::PlatformPreviewController&) {
    return documents_ ? documents_->size() : 0;
}

std::optional<platform::Url>
GlimpseItemController::previewControllerPreviewItemAtIndex(platform::PlatformPreviewController&,
                                                           std::size_t index) {
    return documents_ && index < documents_->size() ? std::optional((*documents_)[index])
                                                    : std::nullopt;
}

void GlimpseItemController::showMoveTarget() {
    VXLOG(vxInfo, "Pressed Move");
    if (const auto manager = itemManager())
        manager->showMoveTarget(*this);
}

void GlimpseItemController::showWarningAndDeleteDocument() {
    if (const auto manager = itemManager())
        manager->showWarningAndDeleteDocument(shared_from_this(), deleteItem_);
}

} // namespace tavrin
