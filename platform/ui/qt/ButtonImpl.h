#pragma once

#include "platform/ui/Controls.h"
#include "platform/ui/qt/TextBlock.h"
#include "platform/ui/qt/ViewImpl.h"

#include <QPushButton>

#include <functional>
#include <optional>
#include <vector>

namespace platform {

/// The real push button behind a Button: Qt gives it press, release, keys and the screen reader's
/// action; we paint it.
class ButtonWidget : public QPushButton {
public:
    ButtonWidget();

protected:
    bool event(QEvent* event) override;
    void paintEvent(QPaintEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;
};

/// The corners of a row that are corners of the card it stands on.
enum class RowCorners : unsigned {
    none = 0,
    topLeft = 1,
    topRight = 2,
    bottomLeft = 4,
    bottomRight = 8
};
constexpr RowCorners operator|(RowCorners a, RowCorners b) {
    return static_cast<RowCorners>(static_cast<unsigned>(a) | static_cast<unsigned>(b));
}

struct ButtonImpl : View::Impl {
    explicit ButtonImpl(ButtonType buttonType);

    void paintContent(QPainter& painter, const QRectF& bounds) override;
    QAccessible::Role accessibleRole() const override { return QAccessible::PushButton; }
    QString accessibleText() const override { return toQtTitle(); }

    QString toQtTitle() const;
    void changed();
    Font shownFont() const;
    Color shownTitleColor() const;
    bool isPressed() const;
    bool isHovered() const;
    void paintFace(QPainter& painter, const QRectF& bounds) const;
    void paintTitle(QPainter& painter, QRectF room) const;
    const TextBlock& titleBlock(double width) const;
    QSizeF titleSize() const;
    void settingsChanged() override;
    double heightForWidth(double width) const;

    ButtonType type;
    std::string title;
    std::optional<Font> font;
    std::optional<Color> titleColor;
    Image image;
    std::vector<std::function<void()>> actions;

    // What bars and alerts ask for beyond the public contract.
    /// Only the image is drawn; the title stays what the screen reader says.
    bool titleHidden = false;
    /// A factor on the title's size, for bars whose room is fixed.
    double titleScale = 1;
    /// The title may take as many lines as it needs.
    bool wraps = false;
    /// Of the title and of the image's room, on both sides.
    double padding = 12;
    /// A row of an alert or a sheet: no corners of its own, darkened whole.
    bool isRow = false;
    RowCorners rowCorners = RowCorners::none;
    TextAlignment titleAlignment = TextAlignment::center;

private:
    void sendClick();

    TextBlockCache blocks_;
};

ButtonImpl& implOf(const Button& button);

} // namespace platform
