#pragma once

#include "platform/base/Url.h"
#include "platform/ui/ViewController.h"

#include <memory>
#include <vector>

namespace platform {

class DocumentTargetSelectionController;

class DocumentTargetSelectionControllerDelegate {
public:
    virtual ~DocumentTargetSelectionControllerDelegate() = default;
    /// A folder was chosen. The delegate dismisses the chooser.
    virtual void
    documentTargetSelectionControllerDidSelectItemAtURL(DocumentTargetSelectionController& chooser,
                                                        const Url& folder) = 0;
};

/// Asks for the folder into which items go: starts where they are, leaves them out as targets, says
/// why a folder cannot take them, makes new folders. Cancelling dismisses it and changes nothing.
class DocumentTargetSelectionController : public ViewController {
public:
    static std::shared_ptr<DocumentTargetSelectionController> create(std::vector<Url> itemsToMove);
    ~DocumentTargetSelectionController() override;

    const std::vector<Url>& itemsToMove() const;
    void setDelegate(std::weak_ptr<DocumentTargetSelectionControllerDelegate> delegate);

    void loadView() override;
    void viewDidLoad() override;
    void viewDidLayoutSubviews() override;

    struct Impl;

private:
    explicit DocumentTargetSelectionController(std::unique_ptr<Impl> impl);
    std::unique_ptr<Impl> impl_;
};

} // namespace platform
