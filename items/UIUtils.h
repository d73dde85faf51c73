#pragma once

#include "platform/base/Result.h"
#include "platform/ui/AlertController.h"

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace tavrin {

/// Renaming, alerts and small helpers of the screens. No state. Main thread.
class UIUtils {
public:
    UIUtils() = delete;

    using Screen = std::shared_ptr<platform::ViewController>;
    /// The chosen action (none when nothing was asked) and whether the user cancelled.
    using DeleteCompletion =
        std::function<void(const platform::AlertAction* action, bool cancelled)>;

    /// Renames within the folder, keeping the extension; a bookmark renames the document it stands
    /// for. invalidFilename for an empty or impossible name; a taken name gets a number.
    [[nodiscard]] static platform::Failure renameItemAtURL(const platform::Url& item,
                                                           std::string_view toName);
    /// The URL of the new name in the same folder; an old extension that the name lacks is put
    /// back.
    static platform::Url computeNewURL(const platform::Url& item, std::string_view newBasename);

    /// The words for an error; "" for none.
    static std::string bestMessage(const platform::Failure& error);
    static void showAlert(std::string_view title, std::string_view message,
                          const Screen& parentViewController);
    /// Unlike bestMessage, no error gives the fallback text.
    static void showError(const platform::Failure& error, const Screen& parentViewController);
    static void showItemExistsAlert(std::string_view name, const Screen& parentViewController);
    static void showInvalidItemNameAlert(std::string_view name, const Screen& parentViewController);
    /// Asks before items are deleted. Nothing is shown, and nobody called, when one item's name
    /// cannot be read; an empty list counts as cancelled.
    static void showDeleteWarningAlert(const std::vector<platform::Url>& items, bool hasContainer,
                                       const Screen& viewController,
                                       const std::shared_ptr<platform::View>& usingView,
                                       const platform::BarButtonItem::Pointer& usingButton,
                                       DeleteCompletion completion);
    static std::optional<std::string>
    messageForDeletePrompt(const std::vector<platform::Url>& items);

    static void setCursorInTextFieldToBeforeExtension(platform::TextField& field);
    /// Location and length in characters (UTF-16 units).
    static void selectTextInTextField(platform::TextField& field, std::size_t location,
                                      std::size_t length);
    static void addChildViewController(platform::ViewController& parent, const Screen& child);
    /// The rectangle across a view's middle at which menus and warnings point.
    static platform::Rect anchorRect(const platform::View& view);
    /// True on a tablet-class device.
    static bool tabloMode();
};

} // namespace tavrin
