#pragma once

#include "platform/files/Progress.h"
#include "platform/ui/Controls.h"
#include "platform/ui/ViewController.h"

#include <functional>
#include <memory>
#include <utility>
#include <vector>

namespace tavrin {

class PreviewItemManager;

/// The common base of the preview screens: an inset wrapper view for the content, the share, delete
/// and move buttons, and the progress of the previewed file. Works for one coordinator. Main
/// thread, except the progress operations.
class PreviewBaseViewController : public platform::ViewController {
public:
    PreviewBaseViewController();
    ~PreviewBaseViewController() override;

    void loadView() override;
    void viewDidLoad() override;
    void viewWillAppear(bool animated) override;
    void viewWillDisappear(bool animated) override;

    /// Pins the wrapper view inside the screen; only inside a navigation stack.
    void setupConstraints();
    /// Sets the margins for the current size classes and bars.
    void configureMargins();
    platform::Orientation currentPseudoOrientation() const;
    /// Shows the current item. Subclasses call the base first.
    virtual void refreshItem();

    /// Subscribes to the progress that is published for the item's file. From any thread.
    void registerForProgress();
    void unregisterProgress();
    /// Every change of the progress, on the thread of whoever updates it.
    virtual void updateProgress(const std::shared_ptr<platform::Progress>& /*progress*/) {}

    void configureButtons();
    /// The control that opens the item in its application, for the navigation bar.
    virtual std::shared_ptr<platform::Button> openInAppNavControllerButton() { return nullptr; }
    void openInDefaultApp();
    void showWarningAndDeleteDocument();
    void showMoveTarget();
    void showDocumentActivities();

    const std::shared_ptr<platform::View>& wrapperView() const { return wrapperView_; }
    std::shared_ptr<PreviewItemManager> itemManager() const { return itemManager_.lock(); }
    void setItemManager(std::weak_ptr<PreviewItemManager> manager) {
        itemManager_ = std::move(manager);
    }
    int mode() const { return mode_; }
    void setMode(int mode) { mode_ = mode; }
    const platform::BarButtonItem::Pointer& barButtonActionItem() const { return actionItem_; }
    const platform::BarButtonItem::Pointer& barButtonDeleteItem() const { return deleteItem_; }
    const platform::BarButtonItem::Pointer& barButtonMoveItem() const { return moveItem_; }
    const platform::LayoutConstraint::Pointer& parentTopConstraint() const {
        return topConstraint_;
    }
    const platform::LayoutConstraint::Pointer& parentBottomConstraint() const {
        return bottomConstraint_;
    }
    const platform::LayoutConstraint::Pointer& parentLeadingConstraint() const {
        return leadingConstraint_;
    }
    const platform::LayoutConstraint::Pointer& parentTrailingConstraint() const {
        return trailingConstraint_;
    }
    int lastProgressChunk() const;

private:
    struct ProgressState;
    using Operation = void (PreviewBaseViewController::*)();

    bool itemHasUrl() const;
    /// What calls the operation for as long as the screen is there.
    std::function<void()> calling(Operation operation);
    platform::BarButtonItem::Pointer makeOpenItem();
    void placeButtons(const platform::BarButtonItem::Pointer& openItem);

    std::shared_ptr<platform::View> wrapperView_;
    std::weak_ptr<PreviewItemManager> itemManager_;
    int mode_ = 0;
    platform::LayoutConstraint::Pointer topConstraint_;
    platform::LayoutConstraint::Pointer bottomConstraint_;
    platform::LayoutConstraint::Pointer leadingConstraint_;
    platform::LayoutConstraint::Pointer trailingConstraint_;
    platform::BarButtonItem::Pointer actionItem_;
    platform::BarButtonItem::Pointer deleteItem_;
    platform::BarButtonItem::Pointer moveItem_;
    std::weak_ptr<platform::Button> connectedControl_;
    std::shared_ptr<ProgressState> progress_;
};

} // namespace tavrin
