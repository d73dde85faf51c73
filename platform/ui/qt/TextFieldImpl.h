#pragma once

#include "platform/ui/Controls.h"
#include "platform/ui/qt/ViewImpl.h"

#include <QLineEdit>
#include <QPushButton>

#include <functional>

namespace platform {

struct TextFieldImpl;

/// The real line edit behind a TextField: input methods, clipboard and undo are Qt's.
class TextFieldWidget : public QLineEdit {
public:
    TextFieldWidget();
    /// Shows the clear button while it is wanted, there is text and the field is being edited.
    void updateClearButton();

protected:
    bool event(QEvent* event) override;
    void paintEvent(QPaintEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;
    void showEvent(QShowEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;

private:
    friend struct TextFieldImpl;
    bool handleReturn(QKeyEvent& event);
    bool insertCapital(const QKeyEvent& event);

    TextFieldImpl* impl_ = nullptr;
    QPushButton* clear_ = nullptr;
    /// Where the user took a capital back: the letter typed there next stays as it is typed.
    int refusedCapital_ = -1;
    bool focusWhenShown_ = false;
};

struct TextFieldImpl : View::Impl {
    TextFieldImpl();

    void settingsChanged() override;
    QString accessibleText() const override;

    TextFieldWidget* edit() const { return static_cast<TextFieldWidget*>(widget.data()); }
    void takeFocus();
    void applyFont();
    void applyHints();
    void userEdited();

    std::string placeholder;
    Font font = Font::preferred(TextStyle::body);
    Capitalization capitalization = Capitalization::none;
    bool autocorrects = true;
    bool returnNeedsText = false;
    bool clearsWhileEditing = false;
    /// Draws its own box; not inside an alert, which draws it around the field.
    bool bordered = true;
    /// The program itself is changing the text.
    bool programSets = false;
    std::function<void(TextField&)> edited;
    std::function<void(TextField&)> returned;
};

TextFieldImpl& implOf(const TextField& field);

} // namespace platform
