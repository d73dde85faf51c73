#pragma once

#include "platform/ui/Font.h"
#include "platform/ui/Image.h"
#include "platform/ui/StyledText.h"
#include "platform/ui/View.h"

#include <functional>
#include <string>
#include <string_view>
#include <utility>

namespace platform {

enum class TextAlignment { natural, left, center, right };
/// Where a line that does not fit loses its text. Middle keeps a file name's extension.
enum class LineBreak { elideTail, elideMiddle, wrap };

/// Text that cannot be edited. One line unless told otherwise; its height follows its solved width.
class Label : public View {
public:
    explicit Label(Rect frame = {});

    const std::string& text() const;
    void setText(std::string_view text);
    /// One line of text with pictures in it; takes the place of the plain text.
    void setStyledText(const StyledText& text);
    Font font() const;
    void setFont(Font font);
    Color textColor() const;
    void setTextColor(Color color);
    TextAlignment textAlignment() const;
    void setTextAlignment(TextAlignment alignment);
    /// 0 means as many as needed.
    int numberOfLines() const;
    void setNumberOfLines(int lines);
    void setLineBreak(LineBreak mode);
    /// Whether the frame is too small for the whole text.
    bool isTruncated() const;

    Size intrinsicContentSize() const override;
    double intrinsicHeightForWidth(double width) const override;
};

enum class ControlEvent : unsigned { touchUpInside = 64 };
/// A system button shows its title in the accent colour; a custom one only what it is given.
enum class ButtonType { custom, system };

/// A control that is pressed by finger, mouse, Space or Enter.
class Button : public View {
public:
    explicit Button(ButtonType type, Rect frame = {});

    ButtonType buttonType() const;
    const std::string& title() const;
    void setTitle(std::string_view title);
    void setTitleFont(Font font);
    /// A title that is wider than the button goes on in a second line instead of eliding.
    void setTitleWraps(bool wraps);
    /// The colour of the title of a destructive or otherwise special button.
    void setTitleColor(Color color);
    void setImage(const Image& image);
    bool isEnabled() const;
    void setEnabled(bool enabled);
    void addAction(ControlEvent event, std::function<void()> action);
    /// What a press does, for keyboard shortcuts and tests.
    void sendActions(ControlEvent event);

    Size intrinsicContentSize() const override;
    double intrinsicHeightForWidth(double width) const override;
};

enum class ContentMode { scaleToFill, aspectFit, center };

class ImageView : public View {
public:
    explicit ImageView(Rect frame = {});
    const Image& image() const;
    void setImage(const Image& image);
    void setContentMode(ContentMode mode);
    Size intrinsicContentSize() const override;
};

enum class ReturnKey { standard, done };
enum class Capitalization { none, words, sentences };

/// A line of text that the user edits; input methods, clipboard and undo are the real control's.
class TextField : public View {
public:
    explicit TextField(Rect frame = {});

    std::string text() const;
    void setText(std::string_view text);
    const std::string& placeholder() const;
    void setPlaceholder(std::string_view text);
    Font font() const;
    void setFont(Font font);
    void setClearButtonWhileEditing(bool shown);
    void setReturnKey(ReturnKey key);
    /// The return key works only while there is text.
    void setReturnKeyNeedsText(bool needed);
    void setCapitalization(Capitalization mode);
    void setAutocorrection(bool enabled);
    /// Shows dots instead of the characters.
    void setSecure(bool secure);
    bool isEnabled() const;
    void setEnabled(bool enabled);
    /// Called on every edit by the user or the clipboard, not by setText.
    void setEditingChangedHandler(std::function<void(TextField&)> handler);
    void setReturnHandler(std::function<void(TextField&)> handler);
    /// In characters (UTF-16 units, as the input method counts); a length of 0 is the cursor.
    void setSelectedRange(std::size_t location, std::size_t length);
    std::pair<std::size_t, std::size_t> selectedRange() const;
    void becomeFirstResponder();
    bool isFirstResponder() const;

    Size intrinsicContentSize() const override;
};

} // namespace platform
