#include "platform/ui/Controls.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/TextFieldImpl.h"

#include <algorithm>
#include <utility>

namespace platform {

TextFieldImpl& implOf(const TextField& field) {
    return static_cast<TextFieldImpl&>(field.impl());
}

TextField::TextField(Rect frame) : View(std::make_unique<TextFieldImpl>()) {
    setFrame(frame);
}

std::string TextField::text() const {
    const TextFieldWidget* const edit = implOf(*this).edit();
    return edit ? fromQt(edit->text()) : std::string();
}

void TextField::setText(std::string_view text) {
    TextFieldImpl& impl = implOf(*this);
    if (TextFieldWidget* const edit = impl.edit()) {
        const bool outer = std::exchange(impl.programSets, true);
        edit->setText(toQt(text));
        impl.programSets = outer;
        edit->updateClearButton();
    }
}

const std::string& TextField::placeholder() const {
    return implOf(*this).placeholder;
}

void TextField::setPlaceholder(std::string_view text) {
    TextFieldImpl& impl = implOf(*this);
    impl.placeholder = text;
    if (impl.edit())
        impl.edit()->setPlaceholderText(toQt(text));
    impl.updateAccessibleName();
}

Font TextField::font() const {
    return implOf(*this).font;
}

void TextField::setFont(Font font) {
    implOf(*this).font = font;
    implOf(*this).applyFont();
}

void TextField::setClearButtonWhileEditing(bool shown) {
    TextFieldImpl& impl = implOf(*this);
    impl.clearsWhileEditing = shown;
    if (impl.edit())
        impl.edit()->updateClearButton();
}

void TextField::setReturnKey(ReturnKey key) {
    // A key with a label is an on-screen keyboard's; the hint reaches it through the input method.
    if (TextFieldWidget* const edit = implOf(*this).edit())
        edit->setProperty("enterKeyType",
                          key == ReturnKey::done ? Qt::EnterKeyDone : Qt::EnterKeyDefault);
}

void TextField::setReturnKeyNeedsText(bool needed) {
    implOf(*this).returnNeedsText = needed;
}

void TextField::setCapitalization(Capitalization mode) {
    implOf(*this).capitalization = mode;
    implOf(*this).applyHints();
}

void TextField::setAutocorrection(bool enabled) {
    implOf(*this).autocorrects = enabled;
    implOf(*this).applyHints();
}

void TextField::setSecure(bool secure) {
    if (TextFieldWidget* const edit = implOf(*this).edit())
        edit->setEchoMode(secure ? QLineEdit::Password : QLineEdit::Normal);
    implOf(*this).applyHints();
}

bool TextField::isEnabled() const {
    const TextFieldWidget* const edit = implOf(*this).edit();
    return edit && edit->isEnabled();
}

void TextField::setEnabled(bool enabled) {
    if (TextFieldWidget* const edit = implOf(*this).edit())
        edit->setEnabled(enabled);
}

void TextField::setEditingChangedHandler(std::function<void(TextField&)> handler) {
    implOf(*this).edited = std::move(handler);
}

void TextField::setReturnHandler(std::function<void(TextField&)> handler) {
    implOf(*this).returned = std::move(handler);
}

void TextField::setSelectedRange(std::size_t location, std::size_t length) {
    TextFieldWidget* const edit = implOf(*this).edit();
    if (!edit)
        return;
    const auto end = static_cast<std::size_t>(edit->text().size());
    location = std::min(location, end);
    length = std::min(length, end - location);
    edit->setCursorPosition(static_cast<int>(location));
    if (length > 0)
        edit->setSelection(static_cast<int>(location), static_cast<int>(length));
}

std::pair<std::size_t, std::size_t> TextField::selectedRange() const {
    const TextFieldWidget* const edit = implOf(*this).edit();
    if (!edit)
        return {0, 0};
    if (edit->hasSelectedText())
        return {static_cast<std::size_t>(edit->selectionStart()),
                static_cast<std::size_t>(edit->selectionLength())};
    return {static_cast<std::size_t>(edit->cursorPosition()), 0};
}

void TextField::becomeFirstResponder() {
    implOf(*this).takeFocus();
}

bool TextField::isFirstResponder() const {
    const TextFieldWidget* const edit = implOf(*this).edit();
    return edit && edit->hasFocus();
}

Size TextField::intrinsicContentSize() const {
    const TextFieldImpl& impl = implOf(*this);
    const double line = impl.font.lineHeight();
    if (!impl.bordered)
        return {noIntrinsicMetric, line};
    return {noIntrinsicMetric, std::max(Theme::minimumTarget, line + 12)};
}

} // namespace platform
