#pragma once

#include "platform/base/Url.h"
#include "platform/ui/ViewController.h"

#include <memory>
#include <optional>
#include <vector>

namespace platform {

class PlatformPreviewController;

class PlatformPreviewDataSource {
public:
    virtual ~PlatformPreviewDataSource() = default;
    virtual std::size_t numberOfPreviewItemsInPreviewController(PlatformPreviewController&) = 0;
    /// A file URL.
    virtual std::optional<Url> previewControllerPreviewItemAtIndex(PlatformPreviewController&,
                                                                   std::size_t index) = 0;
};

class PlatformPreviewDelegate {
public:
    virtual ~PlatformPreviewDelegate() = default;
    virtual void previewControllerDidShowItem(PlatformPreviewController&, const Url& /*item*/) {}
};

/// Shows a whole document: pages, pictures, text, by a renderer chosen from its type. Reading and
/// decoding happen off the main thread; a document that cannot be shown gets a page that says why.
class PlatformPreviewController : public ViewController {
public:
    PlatformPreviewController();
    ~PlatformPreviewController() override;

    /// Whether some renderer shows files of that type. By name; opens nothing.
    static bool canPreview(const Url& url);

    /// Neither is owned; both are usually the subclass itself.
    void setDataSource(PlatformPreviewDataSource* source);
    void setDelegate(PlatformPreviewDelegate* delegate);
    /// Asks the source again and shows the item at the current index.
    void reloadData();
    /// Reads the shown document again, keeping the place in it where that is possible.
    void refreshCurrentPreviewItem();
    /// Shown beside the screen's own share button, the first nearest to the trailing edge.
    void setAdditionalRightBarButtonItems(std::vector<BarButtonItem::Pointer> items);

    void loadView() override;
    void viewWillAppear(bool animated) override;
    void viewDidDisappear(bool animated) override;

    struct Impl;
    Impl& impl() const { return *impl_; }

private:
    std::unique_ptr<Impl> impl_;
};

} // namespace platform
