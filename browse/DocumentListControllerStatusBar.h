#pragma once

#include "platform/documents/DocumentListController.h"
#include "platform/ui/Controls.h"

#include <memory>
#include <vector>

namespace tavrin {

/// The line of small text in the toolbar of a document list: a label, centred by flexible spaces.
/// Each list owns one, attached to it on first use. Main thread.
class DocumentListControllerStatusBar {
public:
    void createStatusBar();
    const std::shared_ptr<platform::Label>& statusLabel() const { return statusLabel_; }
    const std::vector<platform::BarButtonItem::Pointer>& toolbarItems() const {
        return toolbarItems_;
    }

private:
    std::shared_ptr<platform::Label> statusLabel_;
    std::vector<platform::BarButtonItem::Pointer> toolbarItems_;
};

/// The list's status bar; none before createStatusBar.
std::shared_ptr<DocumentListControllerStatusBar>
statusBar(const platform::DocumentListController& list);
void setStatusBar(platform::DocumentListController& list,
                  std::shared_ptr<DocumentListControllerStatusBar> bar);
/// Makes one and attaches it.
void createStatusBar(platform::DocumentListController& list);
/// Puts it into the list's toolbar.
void displayStatusBar(platform::DocumentListController& list);

} // namespace tavrin
