#include "items/UIUtils.h"

#include "app/VXLogging.h"
#include "items/FileUtils.h"
#include "items/UrlExtensions.h"
#include "platform/base/Text.h"
#include "platform/cloud/NameFolding.h"
#include "platform/ui/Application.h"

namespace tavrin {
namespace {

using platform::ActionStyle;
using platform::AlertAction;
using platform::Failure;
using platform::localized;
using platform::Url;

/// Stands in where an error brings no words of its own.
constexpr std::string_view fallbackMessage = "Error exception";

std::string messageOf(const platform::Error& error) {
    if (error.localizedDescription)
        return *error.localizedDescription;
    return error.localizedFailureReason.value_or(std::string(fallbackMessage));
}

/// UTF-16 units of UTF-8 text, as text fields count.
std::size_t characterCount(std::string_view text) {
    std::size_t count = 0;
    for (const char c : text) {
        const auto byte = static_cast<unsigned char>(c);
        if ((byte & 0xC0) != 0x80)
            count += byte >= 0xF0 ? 2 : 1;
    }
    return count;
}

} // namespace

Failure UIUtils::renameItemAtURL(const Url& item, std::string_view toName) {
    if (toName.empty()) {
        VXLOG(vxDebug, "Rename: empty, reverting");
        return platform::makeError(platform::ErrorCode::invalidFilename, toName);
    }
    if (!FileUtils::isValidFilename(toName)) {
        VXLOG(vxDebug, "Name is invalid: %@", toName);
        return platform::makeError(platform::ErrorCode::invalidFilename, toName);
    }
    VXLOG(vxDebug, "Name is valid: %@", toName);
    Url renamed = item;
    if (const std::optional<Url> target = tavrin_URLByResolvingBookmark(item)) {
        VXLOG(vxDebug, "Renaming bookmark %@ (%@)", item, *target);
        renamed = *target;
    }
    const Url newUrl = computeNewURL(renamed, toName);
    if (newUrl == renamed) {
        VXLOG(vxDebug, "Rename: Old and new URLs are the same: %@ - %@", renamed, newUrl);
        return std::nullopt;
    }
    return FileUtils::move(renamed, newUrl);
}

Url UIUtils::computeNewURL(const Url& item, std::string_view newBasename) {
    std::string name(newBasename);
    const std::string_view old = item.pathExtension();
    if (!old.empty() &&
        platform::foldedName(old) != platform::foldedName(platform::pathExtensionOf(newBasename)))
        name.append(".").append(old);
    const std::optional<Url> folder = item.deletingLastPathComponent();
    return folder ? folder->appending(name, item.hasDirectoryMark()) : item;
}

std::string UIUtils::bestMessage(const Failure& error) {
    return error ? messageOf(*error) : "";
}

void UIUtils::showAlert(std::string_view title, std::string_view message,
                        const Screen& parentViewController) {
    auto alert = platform::AlertController::create(title, message, platform::AlertStyle::alert);
    alert->addAction(AlertAction::make(localized("OK"), ActionStyle::standard));
    if (parentViewController)
        parentViewController->presentViewController(alert, true);
}

void UIUtils::showError(const Failure& error, const Screen& parentViewController) {
    showAlert(error ? messageOf(*error) : std::string(fallbackMessage), "", parentViewController);
}

void UIUtils::showItemExistsAlert(std::string_view name, const Screen& parentViewController) {
    const std::string_view extension = platform::pathExtensionOf(name);
    const std::string_view stem = platform::stemOf(name);
    const std::string title =
        extension.empty()
            ? platform::localizedFormat("The name “%@” is already taken.", stem)
            : platform::localizedFormat("The name “%1$@” with extension “.%2$@” is already taken.",
                                        stem, extension);
    showAlert(title, localized("Choose a different name."), parentViewController);
}

void UIUtils::showInvalidItemNameAlert(std::string_view name, const Screen& parentViewController) {
    showAlert("",
              platform::localizedFormat("The name “%@” can’t be used. Try using a name with fewer "
                                        "characters, or with no punctuation marks.",
                                        name),
              parentViewController);
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

void UIUtils::setCursorInTextFieldToBeforeExtension(platform::TextField& field) {
    const std::string text = field.text();
    const std::size_t dot = text.rfind('.');
    if (text.empty())
        selectTextInTextField(field, 0, 0);
    else if (dot != std::string::npos)
        selectTextInTextField(field, characterCount(std::string_view(text).substr(0, dot)), 0);
}

void UIUtils::selectTextInTextField(platform::TextField& field, std::size_t location,
                                    std::size_t length) {
    field.setSelectedRange(location, length);
}

void UIUtils::addChildViewController(platform::ViewController& parent, const Screen& child) {
    parent.addChildViewController(child);
    parent.view()->addSubview(child->view());
    child->didMoveToParent(&parent);
}

platform::Rect UIUtils::anchorRect(const platform::View& view) {
    const platform::Rect bounds = view.bounds();
    return {bounds.x, bounds.midY(), bounds.width, 0};
}

bool UIUtils::tabloMode() {
    return platform::Application::shared().idiom() == platform::DeviceIdiom::tablet;
}

} // namespace tavrin
