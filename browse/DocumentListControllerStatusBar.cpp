#include "browse/DocumentListControllerStatusBar.h"

#include "app/Settings.h"

namespace tavrin {
namespace {

constexpr const char* statusBarKey = "_TavrinAppStatusBar";

} // namespace

void DocumentListControllerStatusBar::createStatusBar() {
    statusLabel_ = std::make_shared<platform::Label>();
    statusLabel_->setTextColor(Settings::statusLabelColor());
    statusLabel_->setFont(platform::Font::preferred(platform::TextStyle::footnote));
    const auto space = platform::BarButtonItem::withSystemItem(platform::SystemItem::flexibleSpace);
    toolbarItems_ = {space, platform::BarButtonItem::withCustomView(statusLabel_), space};
}

std::shared_ptr<DocumentListControllerStatusBar>
statusBar(const platform::DocumentListController& list) {
    return std::static_pointer_cast<DocumentListControllerStatusBar>(
        list.associatedObject(statusBarKey));
}

void setStatusBar(platform::DocumentListController& list,
                  std::shared_ptr<DocumentListControllerStatusBar> bar) {
    list.setAssociatedObject(statusBarKey, std::move(bar));
}

void createStatusBar(platform::DocumentListController& list) {
    auto bar = std::make_shared<DocumentListControllerStatusBar>();
    setStatusBar(list, bar);
    bar->createStatusBar();
}

void displayStatusBar(platform::DocumentListController& list) {
    list.setToolbarItems(statusBar(list)->toolbarItems());
}

} // namespace tavrin
