#include "app/VXLogging.h"
#include "items/UIUtils.h"
#include "items/VXItem.h"
#include "platform/base/Text.h"

namespace tavrin {

using platform::ActionStyle;
using platform::AlertAction;
using platform::localized;
using platform::localizedFormat;

std::optional<std::string>
UIUtils::messageForDeletePrompt(const std::vector<platform::Url>& items) {
    if (items.size() != 1) {
        return localizedFormat(
            "%@ will be permanently deleted from Tavrin on all your devices. This action cannot be "
            "undone.",
            platform::localizedPlural(".DICT.ITEMS.%d", static_cast<long long>(items.size())));
    }
    const VXItem item(items.front());
    if (!item.localizedName() || item.localizedName()->empty())
        return std::nullopt;
    if (item.isContainer()) {
        return localizedFormat(
            "The %@ app library, and all its documents, will be permanently deleted from Tavrin on "
            "all your devices. This action cannot be undone.",
            *item.localizedName());
    }
    return localizedFormat(
        "\"%@\" will be permanently deleted from Tavrin on all your devices. This action cannot be "
        "undone.",
        *item.localizedName());
}

void UIUtils::showDeleteWarningAlert(const std::vector<platform::Url>& items, bool /*hasContainer*/,
                                     const Screen& viewController,
                                     const std::shared_ptr<platform::View>& usingView,
                                     const platform::BarButtonItem::Pointer& usingButton,
                                     DeleteCompletion completion) {
    if (items.empty()) {
        completion(nullptr, true);
        return;
    }
    const std::optional<std::string> message = messageForDeletePrompt(items);
    if (!message)
        return;
    auto sheet = platform::AlertController::create("", *message, platform::AlertStyle::actionSheet);
    sheet->addAction(AlertAction::make(localized("Delete from Tavrin"), ActionStyle::destructive,
                                       [completion](AlertAction& action) {
                                           VXLOG(vxDebug, "Delete action");
                                           completion(&action, false);
                                       }));
    sheet->addAction(AlertAction::make(localized("Cancel"), ActionStyle::cancel,
                                       [completion](AlertAction& action) {
                                           VXLOG(vxInfo, "Delete: Cancel pressed");
                                           completion(&action, true);
                                       }));
    if (usingView)
        sheet->setPopoverAnchor(usingView, anchorRect(*usingView),
                                platform::ArrowDirection::left | platform::ArrowDirection::right);
    else if (usingButton)
        sheet->setPopoverAnchor(usingButton);
    viewController->presentViewController(sheet, true);
}

} // namespace tavrin
