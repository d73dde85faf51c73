#include "platform/ui/qt/TextFieldImpl.h"

#include "platform/base/Text.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"

#include <QKeyEvent>
#include <QPainter>

#include <cmath>

namespace platform {
namespace {

constexpr int sidePadding = 12;
constexpr int clearButtonWidth = 44;
constexpr double clearDiscRadius = 9;

/// The grey disc with a cross that empties the field.
class ClearButton : public QPushButton {
public:
    explicit ClearButton(QWidget* parent) : QPushButton(parent) {
        setFocusPolicy(Qt::NoFocus);
        setCursor(Qt::ArrowCursor);
        setAutoDefault(false);
        setAccessibleName(toQt(localized("Clear text")));
        hide();
    }

protected:
    void paintEvent(QPaintEvent* /*event*/) override {
        QPainter painter(this);
        painter.setRenderHint(QPainter::Antialiasing);
        const QPointF center(width() / 2.0, height() / 2.0);
        painter.setPen(Qt::NoPen);
        painter.setBrush(toQt(isDown() ? Theme::text : Theme::badge));
        painter.drawEllipse(center, clearDiscRadius, clearDiscRadius);
        painter.setPen(QPen(Qt::white, 1.75, Qt::SolidLine, Qt::RoundCap));
        const double arm = 3.25;
        painter.drawLine(center + QPointF(-arm, -arm), center + QPointF(arm, arm));
        painter.drawLine(center + QPointF(-arm, arm), center + QPointF(arm, -arm));
    }
};

bool startsWord(const QString& text, int at, Capitalization mode) {
    int before = at - 1;
    if (mode == Capitalization::words)
        return before < 0 || text[before].isSpace();
    while (before >= 0 && text[before].isSpace())
        --before;
    return before < 0 || (before < at - 1 && QStringLiteral(".!?").contains(text[before]));
}

} // namespace

TextFieldWidget::TextFieldWidget() {
    setFrame(false);
    setAttribute(Qt::WA_MacShowFocusRect, false);
    setTextMargins(sidePadding, 0, sidePadding, 0);
    clear_ = new ClearButton(this);
    QObject::connect(clear_, &QPushButton::clicked, this, [this] {
        // As the user's own deletion: undo brings the text back.
        selectAll();
        del();
    });
    // Not textEdited: what is typed for the user by a screen reader's tools comes without it.
    QObject::connect(this, &QLineEdit::textChanged, this, [this] {
        if (impl_ && !impl_->programSets)
            impl_->userEdited();
    });
}

void TextFieldWidget::updateClearButton() {
    const bool shown = impl_ && impl_->clearsWhileEditing && hasFocus() && !text().isEmpty();
    clear_->setVisible(shown);
    const int edge = impl_ && !impl_->bordered ? 0 : sidePadding;
    const int room = shown ? clearButtonWidth : edge;
    // Text stands at the leading edge of the program, in whichever direction it runs itself.
    const bool rightToLeft = layoutDirection() == Qt::RightToLeft;
    setAlignment((rightToLeft ? Qt::AlignRight : Qt::AlignLeft) | Qt::AlignAbsolute |
                 Qt::AlignVCenter);
    setTextMargins(rightToLeft ? room : edge, 0, rightToLeft ? edge : room, 0);
}

bool TextFieldWidget::event(QEvent* event) {
    const bool handled = QLineEdit::event(event);
    switch (event->type()) {
    case QEvent::FocusIn:
    case QEvent::FocusOut:
    case QEvent::LayoutDirectionChange:
        updateClearButton();
        resizeEvent(nullptr);
        update();
        if (parentWidget())
            parentWidget()->update();
        break;
    default:
        break;
    }
    return handled;
}

void TextFieldWidget::paintEvent(QPaintEvent* event) {
    if (impl_) {
        QPainter painter(this);
        if (!isEnabled())
            painter.setOpacity(Theme::disabledAlpha);
        painter.setRenderHint(QPainter::Antialiasing);
        if (impl_->bordered) {
            const double line = hasFocus() ? 2 : 1;
            painter.setPen(QPen(toQt(hasFocus() ? Theme::accent : Theme::hairline), line));
            painter.setBrush(toQt(impl_->background.value_or(Theme::page)));
            const double half = line / 2;
            painter.drawRoundedRect(QRectF(rect()).adjusted(half, half, -half, -half),
                                    Theme::buttonCorner, Theme::buttonCorner);
        }
    }
    QLineEdit::paintEvent(event);
}

void TextFieldWidget::resizeEvent(QResizeEvent* event) {
    if (event)
        QLineEdit::resizeEvent(event);
    const bool rightToLeft = layoutDirection() == Qt::RightToLeft;
    clear_->setGeometry(rightToLeft ? 0 : width() - clearButtonWidth, 0, clearButtonWidth,
                        height());
}

void TextFieldWidget::showEvent(QShowEvent* event) {
    QLineEdit::showEvent(event);
    if (std::exchange(focusWhenShown_, false))
        setFocus(Qt::OtherFocusReason);
}

void TextFieldWidget::keyPressEvent(QKeyEvent* event) {
    const bool isReturn = event->key() == Qt::Key_Return || event->key() == Qt::Key_Enter;
    if (isReturn ? handleReturn(*event) : insertCapital(*event))
        return;
    if (event->key() == Qt::Key_Backspace && cursorPosition() > 0 && !hasSelectedText() &&
        text().at(cursorPosition() - 1).isUpper())
        refusedCapital_ = cursorPosition() - 1;
    QLineEdit::keyPressEvent(event);
}

/// True when nobody else may have the key: neither the field's screen nor an alert around it.
bool TextFieldWidget::handleReturn(QKeyEvent& event) {
    if (!impl_ || (impl_->returnNeedsText && text().isEmpty()))
        return true;
    if (!impl_->returned) {
        event.ignore();
        return true;
    }
    keepUntilNextTurn(impl_->self->shared_from_this());
    const auto handler = impl_->returned;
    handler(static_cast<TextField&>(*impl_->self));
    return true;
}

/// Letters that a key types; what an input method commits is the user's own choice already.
bool TextFieldWidget::insertCapital(const QKeyEvent& event) {
    if (!impl_ || impl_->capitalization == Capitalization::none || echoMode() != Normal ||
        (event.modifiers() & ~Qt::KeypadModifier) != Qt::NoModifier)
        return false;
    const QString typed = event.text();
    const int at = hasSelectedText() ? selectionStart() : cursorPosition();
    if (typed.size() != 1 || !typed[0].isLower() || at == std::exchange(refusedCapital_, -1) ||
        !startsWord(text(), at, impl_->capitalization))
        return false;
    const QString capital = QString(typed[0].toTitleCase());
    QKeyEvent upper(QEvent::KeyPress, event.key(), Qt::NoModifier, capital, event.isAutoRepeat());
    QLineEdit::keyPressEvent(&upper);
    return true;
}

TextFieldImpl::TextFieldImpl() : View::Impl(std::make_unique<TextFieldWidget>()) {
    edit()->impl_ = this;
    applyFont();
    applyHints();
}

void TextFieldImpl::settingsChanged() {
    View::Impl::settingsChanged();
    applyFont();
}

QString TextFieldImpl::accessibleText() const {
    return toQt(placeholder);
}

void TextFieldImpl::takeFocus() {
    if (!edit())
        return;
    if (edit()->isVisible())
        edit()->setFocus(Qt::OtherFocusReason);
    else
        edit()->focusWhenShown_ = true;
}

void TextFieldImpl::applyFont() {
    if (!edit())
        return;
    edit()->setFont(toQt(font));
    edit()->updateClearButton();
    if (self)
        self->invalidateIntrinsicContentSize();
}

void TextFieldImpl::applyHints() {
    if (!edit())
        return;
    Qt::InputMethodHints hints = Qt::ImhNone;
    if (!autocorrects)
        hints |= Qt::ImhNoPredictiveText;
    if (capitalization == Capitalization::none)
        hints |= Qt::ImhNoAutoUppercase;
    if (edit()->echoMode() != QLineEdit::Normal)
        hints |= Qt::ImhHiddenText | Qt::ImhSensitiveData | Qt::ImhNoPredictiveText |
                 Qt::ImhNoAutoUppercase;
    edit()->setInputMethodHints(hints);
}

void TextFieldImpl::userEdited() {
    edit()->updateClearButton();
    keepUntilNextTurn(self->shared_from_this());
    if (const auto handler = edited)
        handler(static_cast<TextField&>(*self));
}

} // namespace platform
