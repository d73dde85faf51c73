#pragma once

#include "platform/documents/PlatformPreviewController.h"

#include <memory>
#include <optional>
#include <vector>

namespace tavrin {

class PreviewItemManager;

/// The full preview of the current item, with buttons to move and delete it. One shared instance:
/// it shows the item of the coordinator that used it last. Main thread.
class GlimpseItemController : public platform::PlatformPreviewController,
                              public platform::PlatformPreviewDataSource,
                              public platform::PlatformPreviewDelegate {
public:
    /// Lives as long as the application.
    static const std::shared_ptr<GlimpseItemController>& defaultController();
    static std::shared_ptr<GlimpseItemController> create();
    static std::shared_ptr<GlimpseItemController>
    createWithItemManager(const std::shared_ptr<PreviewItemManager>& manager);

    /// Shows the manager's item from now on; no document when it has none.
    void glimpseNewItem(const std::shared_ptr<PreviewItemManager>& manager);
    /// The view is loaded and in a window.
    bool isVisible();
    void viewWillDisappear(bool animated) override;
    std::size_t
    numberOfPreviewItemsInPreviewController(platform::PlatformPreviewController&) override;
    std::optional<platform::Url>
    previewControllerPreviewItemAtIndex(platform::PlatformPreviewController&,
                                        std::size_t index) override;
    void showMoveTarget();
    void showWarningAndDeleteDocument();

    std::shared_ptr<PreviewItemManager> itemManager() const { return itemManager_.lock(); }
    const std::optional<std::vector<platform::Url>>& arrayOfDocuments() const { return documents_; }
    const platform::BarButtonItem::Pointer& barButtonMoveItem() const { return moveItem_; }
    const platform::BarButtonItem::Pointer& barButtonDeleteItem() const { return deleteItem_; }

private:
    GlimpseItemController() = default;
    void init();
    void takeManager(const std::shared_ptr<PreviewItemManager>& manager);

    std::weak_ptr<PreviewItemManager> itemManager_;
    std::optional<std::vector<platform::Url>> documents_;
    platform::BarButtonItem::Pointer moveItem_;
    platform::BarButtonItem::Pointer deleteItem_;
};

} // namespace tavrin
