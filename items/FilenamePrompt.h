#pragma once

#include "items/SimpleTextViewController.h"
#include "platform/ui/AlertController.h"

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

namespace tavrin {

/// An alert with one text field that asks for a file or folder name, checks it while it is typed
/// and closes only when its owner accepted it. The caller presents alert(); the prompt lives at
/// least as long as that. Main thread.
class FilenamePrompt : public std::enable_shared_from_this<FilenamePrompt> {
public:
    /// Given the trimmed name (none when it is no valid name) and a flag that starts false: answers
    /// the error text to show (none or empty for none) and sets the flag when the alert may close.
    using ValidateCallback = std::function<std::optional<std::string>(
        const std::optional<std::string>& name, bool& dismiss)>;
    using Text = std::optional<std::string>;

    static std::shared_ptr<FilenamePrompt>
    newWithTitle(const Text& title, const Text& message, const Text& placeholder,
                 const Text& filename, const Text& doneButtonText, ValidateCallback completion);

    const std::shared_ptr<platform::AlertController>& alert() const { return alert_; }
    const std::shared_ptr<SimpleTextViewController>& errMsgViewController() const {
        return errMsg_;
    }
    const platform::AlertAction::Pointer& defaultAction() const { return defaultAction_; }
    const Text& origFilename() const { return origFilename_; }
    const ValidateCallback& validateNewFilenameCallback() const { return validate_; }

    void addCancelAction(platform::AlertAction::Handler handler);
    void addDefaultAction(const Text& doneButtonText);
    /// Shows the text under the field; hides the line when there is none.
    void updateErrorMessage(const Text& message);
    /// Every edit of the field.
    void folderPromptTextFieldChanged(platform::TextField& field);

private:
    void initWithTitle(const Text& title, const Text& message, const Text& placeholder,
                       const Text& doneButtonText);
    void addField(const Text& accessibleName, const Text& placeholder);
    bool mayDismiss();

    std::shared_ptr<platform::AlertController> alert_;
    std::shared_ptr<SimpleTextViewController> errMsg_;
    platform::AlertAction::Pointer defaultAction_;
    Text origFilename_;
    ValidateCallback validate_;
};

/// Asks for the name of a new folder.
class NewFolderPrompt : public FilenamePrompt {
public:
    static std::shared_ptr<FilenamePrompt>
    newWithTitle(const Text& title, const Text& doneButtonText, ValidateCallback completion);
};

/// Asks for a new name of an item.
class RenamePrompt : public FilenamePrompt {
public:
    static std::shared_ptr<FilenamePrompt> newWithFilename(const Text& filename,
                                                           ValidateCallback completion);
};

} // namespace tavrin
