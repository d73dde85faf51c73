#include "items/FilenamePrompt.h"

#include "items/FileUtils.h"
#include "platform/base/Text.h"

#include <string_view>

namespace tavrin {
namespace {

using platform::AlertAction;
using platform::localized;
using platform::TextField;

constexpr double fieldHeightInLines = 1.2;

/// White space and line ends of text, at the front of `text`: bytes to skip, 0 when there is none.
std::size_t whiteSpaceLength(std::string_view text) {
    if (text.empty())
        return 0;
    if (std::string_view(" \t\n\v\f\r").find(text.front()) != std::string_view::npos)
        return 1;
    for (const std::string_view space :
         {"\u00A0", "\u0085", "\u1680", "\u2000", "\u2001", "\u2002", "\u2003", "\u2004", "\u2005",
          "\u2006", "\u2007", "\u2008", "\u2009", "\u200A", "\u2028", "\u2029", "\u202F", "\u205F",
          "\u3000"})
        if (text.starts_with(space))
            return space.size();
    return 0;
}

std::string trimmed(std::string_view text) {
    while (const std::size_t length = whiteSpaceLength(text))
        text.remove_prefix(length);
    for (std::size_t start = text.size(); start > 0;) {
        --start;
        // Only the start of a character can begin a run of white space.
        if ((static_cast<unsigned char>(text[start]) & 0xC0) == 0x80)
            continue;
        if (whiteSpaceLength(text.substr(start)) != text.size() - start)
            break;
        text.remove_suffix(text.size() - start);
    }
    return std::string(text);
}

} // namespace

std::shared_ptr<FilenamePrompt> FilenamePrompt::newWithTitle(const Text& title, const Text& message,
                                                             const Text& placeholder,
                                                             const Text& filename,
                                                             const Text& doneButtonText,
                                                             ValidateCallback completion) {
    auto prompt = std::make_shared<FilenamePrompt>();
    prompt->origFilename_ = filename;
    prompt->validate_ = std::move(completion);
    prompt->initWithTitle(title, message, placeholder, doneButtonText);
    return prompt;
}

void FilenamePrompt::initWithTitle(const Text& title, const Text& message, const Text& placeholder,
                                   const Text& doneButtonText) {
    alert_ = platform::AlertController::create(title.value_or(""), message.value_or(""),
                                               platform::AlertStyle::alert);
    addField(message ? message : title, placeholder);
    addCancelAction({});
    addDefaultAction(doneButtonText);
    errMsg_ = std::make_shared<SimpleTextViewController>();
    alert_->setContentViewController(errMsg_);
    updateErrorMessage("");
}

void FilenamePrompt::addField(const Text& accessibleName, const Text& placeholder) {
    alert_->addTextField([&](TextField& field) {
        if (origFilename_)
            field.setText(*origFilename_);
        if (placeholder)
            field.setPlaceholder(*placeholder);
        // The placeholder may be the very name that is to be replaced: no name for the field.
        field.setAccessibleName(accessibleName.value_or(""));
        field.setClearButtonWhileEditing(true);
        field.setReturnKey(platform::ReturnKey::done);
        field.setReturnKeyNeedsText(true);
        field.setCapitalization(platform::Capitalization::words);
        field.setAutocorrection(false);
        field.setEditingChangedHandler([weak = weak_from_this()](TextField& changed) {
            if (const auto self = weak.lock())
                self->folderPromptTextFieldChanged(changed);
        });
        platform::LayoutConstraint::constant(field, platform::LayoutAttribute::height,
                                             platform::LayoutRelation::equal,
                                             fieldHeightInLines * field.font().lineHeight())
            ->setActive(true);
    });
}

void FilenamePrompt::addCancelAction(AlertAction::Handler handler) {
    alert_->addAction(AlertAction::make(localized("Cancel"), platform::ActionStyle::standard,
                                        std::move(handler)));
}

void FilenamePrompt::addDefaultAction(const Text& doneButtonText) {
    const bool hasText = doneButtonText && !doneButtonText->empty();
    // The handler does nothing but hold the prompt for as long as the alert holds the action.
    defaultAction_ =
        AlertAction::make(hasText ? *doneButtonText : localized("Done"),
                          platform::ActionStyle::standard, [self = shared_from_this()](auto&) {});
    defaultAction_->setShouldDismissHandler([weak = weak_from_this()] {
        const auto self = weak.lock();
        return self && self->mayDismiss();
    });
    if (!origFilename_ || origFilename_->empty())
        defaultAction_->setEnabled(false);
    alert_->addAction(defaultAction_);
}

bool FilenamePrompt::mayDismiss() {
    if (alert_->textFields().empty())
        return false;
    std::optional<std::string> name = trimmed(alert_->textFields().front()->text());
    if (!FileUtils::isValidFilename(*name))
        name.reset();
    bool dismiss = false;
    updateErrorMessage(validate_ ? validate_(name, dismiss) : std::nullopt);
    return dismiss;
}

void FilenamePrompt::updateErrorMessage(const Text& message) {
    const bool shown = message && !message->empty();
    errMsg_->messageLabel()->setText(message.value_or(""));
    errMsg_->view()->setHidden(!shown);
}

void FilenamePrompt::folderPromptTextFieldChanged(TextField& field) {
    if (!defaultAction_)
        return;
    const std::string name = trimmed(field.text());
    const bool valid = FileUtils::isValidFilename(name);
    if (valid)
        updateErrorMessage(std::nullopt);
    else
        updateErrorMessage(name.empty() ? "" : localized("Character not allowed in filename"));
    defaultAction_->setEnabled(valid);
}

std::shared_ptr<FilenamePrompt> NewFolderPrompt::newWithTitle(const Text& title,
                                                              const Text& doneButtonText,
                                                              ValidateCallback completion) {
    return FilenamePrompt::newWithTitle(title, localized("Enter a name for this folder."),
                                        localized("Folder Name"), std::nullopt, doneButtonText,
                                        std::move(completion));
}

std::shared_ptr<FilenamePrompt> RenamePrompt::newWithFilename(const Text& filename,
                                                              ValidateCallback completion) {
    return FilenamePrompt::newWithTitle(localized("Rename Item"),
                                        localized("Enter a new name for this item."), filename,
                                        filename, localized("Done"), std::move(completion));
}

} // namespace tavrin
