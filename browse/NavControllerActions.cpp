#include "app/VXLogging.h"
#include "browse/NavController.h"
#include "items/UIUtils.h"
#include "platform/base/Text.h"

namespace tavrin {

using platform::ActionStyle;
using platform::AlertAction;
using platform::localized;
using platform::Url;

void NavController::showActionsMenuFromView(const std::shared_ptr<platform::View>& view,
                                            const Url& url, const Url& presentedURL,
                                            std::function<void()> completion) {
    const VXItem item(url);
    auto sheet = platform::AlertController::create("", "", platform::AlertStyle::actionSheet);
    // The sheet may outlive this screen; what it does then is only to complete.
    const auto add = [&](std::string_view title, bool enabled,
                         std::function<void(NavController&)> work) {
        auto action = AlertAction::make(
            title, ActionStyle::standard,
            [weak = weak_from_this(), work = std::move(work), completion](AlertAction&) {
                if (const auto screen = std::static_pointer_cast<NavController>(weak.lock()))
                    work(*screen);
                completion();
            });
        action->setEnabled(enabled && !item.isContainer());
        sheet->addAction(std::move(action));
    };
    add(localized("Rename Item…"), item.renameable(),
        [url](NavController& screen) { screen.showRenamePrompt(url); });
    if (!item.isDirectory())
        add(localized("Share Item…"), true, [view, url, completion](NavController& screen) {
            screen.showDIC(view, url, completion);
        });
    if (!item.isContainer() && containerHasSubfolders(url))
        add(localized("Move to Folder…"), true, [url, presentedURL](NavController& screen) {
            screen.showMoveTargetForItems({url}, presentedURL);
        });
    sheet->addAction(AlertAction::make(localized("Cancel"), ActionStyle::cancel,
                                       [completion](AlertAction&) { completion(); }));
    sheet->setPopoverAnchor(view, UIUtils::anchorRect(*view),
                            platform::ArrowDirection::left | platform::ArrowDirection::right);
    presentViewController(sheet, true);
}

void NavController::presentPrompt(std::shared_ptr<FilenamePrompt> prompt) {
    folderPromptAlert_ = std::move(prompt);
    presentViewController(folderPromptAlert_->alert(), true);
}

void NavController::showRenamePrompt(const Url& url) {
    const VXItem item(url);
    presentPrompt(RenamePrompt::newWithFilename(
        item.localizedName(),
        [url](const std::optional<std::string>& name, bool& dismiss) -> FilenamePrompt::Text {
            if (!name || name->empty())
                return std::nullopt;
            const platform::Failure failure = UIUtils::renameItemAtURL(url, *name);
            dismiss = !failure;
            return UIUtils::bestMessage(failure);
        }));
}

void NavController::showDIC(const std::shared_ptr<platform::View>& view, const platform::Value& url,
                            const std::function<void()>& /*completion*/) {
    if (!url.url()) {
        VXLOG(vxWarning, "showDIC: url is wrong class: %@", url.kindName());
        return;
    }
    VXLOG(vxInfo, "showDIC: %@", *url.url());
    documentInteractionController_ = platform::DocumentInteractionController::create(*url.url());
    documentInteractionController_->setDelegate(
        std::weak_ptr<platform::DocumentInteractionControllerDelegate>(self()));
    const platform::Rect rect = view ? UIUtils::anchorRect(*view) : platform::Rect{};
    documentInteractionController_->presentOptionsMenuFromRectInView(
        rect, view ? view : this->view(), true);
}

} // namespace tavrin
