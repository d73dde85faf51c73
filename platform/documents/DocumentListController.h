#pragma once

#include "platform/base/Url.h"
#include "platform/ui/ViewController.h"

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace platform {

class DocumentListController;

/// Row actions, by the numbers under which they are reported; bit n of availableActions offers n.
enum class DocumentAction : int { remove = 0, more = 1, information = 2, rename = 3 };

class DocumentListControllerDelegate {
public:
    virtual ~DocumentListControllerDelegate() = default;
    /// A folder or container was tapped; `next` is a new, unconfigured list for it.
    virtual void documentListControllerDidSelectContainerWithViewController(
        DocumentListController& /*list*/, const std::shared_ptr<DocumentListController>& /*next*/) {
    }
    virtual void documentListControllerDidSelectItemAtURL(DocumentListController& /*list*/,
                                                          const Url& /*url*/) {}
    /// The contained items or the selection changed.
    virtual void documentListControllerItemsChanged(DocumentListController& /*list*/) {}
    /// A row action was chosen. `completion` must be called once it is dealt with.
    virtual void documentListControllerPerformAction(
        DocumentListController& /*list*/, int /*action*/, const Url& /*url*/,
        const std::shared_ptr<View>& /*originatingView*/, std::function<void()> completion) {
        completion();
    }
};

/// One folder of the store as a screen: rows that are always in step with the disk, selection in
/// edit mode, row actions by swipe, by "more" and by the menu key. Virtualised: a folder of 100,000
/// entries opens at once. Main thread; reads the disk on a queue of its own.
class DocumentListController : public ViewController {
public:
    /// A list of the store's root (one entry a container); none when there is no store.
    static std::shared_ptr<DocumentListController> create();
    static std::shared_ptr<DocumentListController> createForURL(const Url& folder);
    /// The lists from the store's root down to `folder`, in order; none when the folder is not
    /// inside the store or not there.
    static std::optional<std::vector<std::shared_ptr<DocumentListController>>>
    listControllerHierarchyForURL(const Url& folder);
    ~DocumentListController() override;

    const Url& presentedURL() const;
    /// The URLs of the entries shown, in display order. A document that is only promised is there
    /// under its logical URL.
    std::vector<Url> containedItems() const;
    std::size_t containedItemCount() const;
    std::vector<Url> selectedItems() const;
    std::size_t selectedItemCount() const;
    /// How many of them are containers.
    std::size_t selectedContainerCount() const;
    void setSelectedItems(const std::vector<Url>& items);
    bool isEditing() const;
    void setEditing(bool editing, bool animated);
    unsigned availableActions() const;
    void setAvailableActions(unsigned bits);
    void setDelegate(std::weak_ptr<DocumentListControllerDelegate> delegate);
    std::shared_ptr<DocumentListControllerDelegate> delegate() const;

    /// Something attached to the list under a key, owned by it.
    std::shared_ptr<void> associatedObject(const std::string& key) const;
    void setAssociatedObject(const std::string& key, std::shared_ptr<void> object);

    void loadView() override;
    void viewWillAppear(bool animated) override;
    void viewDidAppear(bool animated) override;
    void viewWillDisappear(bool animated) override;
    bool performKeyCommand(KeyCommand command) override;

    struct Impl;
    Impl& impl() const { return *impl_; }

private:
    explicit DocumentListController(std::unique_ptr<Impl> impl);
    std::unique_ptr<Impl> impl_;
};

} // namespace platform
