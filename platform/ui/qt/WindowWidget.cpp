#include "platform/ui/qt/WindowWidget.h"

#include "platform/ui/Application.h"
#include "platform/ui/Window.h"
#include "platform/ui/qt/FocusOrder.h"
#include "platform/ui/qt/ViewImpl.h"
#include "platform/ui/qt/WindowImpl.h"

#include <QCloseEvent>
#include <QCoreApplication>
#include <QKeyEvent>
#include <QKeySequence>
#include <QLineEdit>
#include <QResizeEvent>

#include <optional>

namespace platform {
namespace {

QEvent::Type layoutEventType() {
    static const auto type = static_cast<QEvent::Type>(QEvent::registerEventType());
    return type;
}

std::optional<KeyCommand> commandOf(const QKeyEvent& event) {
    if (event.matches(QKeySequence::Find))
        return KeyCommand::find;
    if (event.matches(QKeySequence::SelectAll))
        return KeyCommand::selectAll;
    const bool altLeft = event.key() == Qt::Key_Left && event.modifiers() == Qt::AltModifier;
    if (altLeft || event.key() == Qt::Key_Back)
        return KeyCommand::back;
    if ((event.modifiers() & ~Qt::KeypadModifier) != Qt::NoModifier)
        return std::nullopt;
    if (event.key() == Qt::Key_Escape)
        return KeyCommand::cancel;
    if (event.key() == Qt::Key_Down)
        return KeyCommand::down;
    if (event.key() == Qt::Key_Return || event.key() == Qt::Key_Enter)
        return KeyCommand::confirm;
    return std::nullopt;
}

} // namespace

void WindowWidget::postLayout() {
    if (!std::exchange(layoutPosted_, true))
        QCoreApplication::postEvent(this, new QEvent(layoutEventType()), Qt::HighEventPriority);
}

const QWidget* WindowWidget::focusScope() const {
    return window_ ? &window_->impl().focusScope() : nullptr;
}

bool WindowWidget::event(QEvent* event) {
    if (event->type() == layoutEventType()) {
        layoutPosted_ = false;
        if (window_)
            window_->layoutIfNeeded();
        return true;
    }
    // Nothing is painted before it is laid out.
    if (event->type() == QEvent::UpdateRequest && window_)
        window_->layoutIfNeeded();
    if ((event->type() == QEvent::Show || event->type() == QEvent::Move ||
         event->type() == QEvent::ScreenChangeInternal) &&
        window_)
        window_->impl().screenChanged();
    return QWidget::event(event);
}

void WindowWidget::resizeEvent(QResizeEvent* event) {
    QWidget::resizeEvent(event);
    if (window_)
        window_->impl().sizeChanged();
}

void WindowWidget::keyPressEvent(QKeyEvent* event) {
    if (!window_)
        return;
    // The focus may rest on no control; Tab then begins at the first.
    if (event->key() == Qt::Key_Tab || event->key() == Qt::Key_Backtab) {
        focusNextPrevChild(event->key() == Qt::Key_Tab);
        return;
    }
    if (event->matches(QKeySequence::Quit)) {
        window_->close();
        return;
    }
    const auto command = commandOf(*event);
    if (!command || !window_->impl().sendKeyCommand(*command))
        QWidget::keyPressEvent(event);
}

void WindowWidget::mousePressEvent(QMouseEvent* event) {
    if (event->button() == Qt::BackButton && window_)
        window_->impl().sendKeyCommand(KeyCommand::back);
    else if (auto* const field = qobject_cast<QLineEdit*>(focusWidget());
             field && event->button() == Qt::LeftButton)
        // Ends typing; a list keeps its keys.
        field->clearFocus();
}

void WindowWidget::closeEvent(QCloseEvent* event) {
    if (window_)
        window_->impl().willClose();
    QWidget::closeEvent(event);
}

bool WindowWidget::focusNextPrevChild(bool next) {
    return window_ && moveFocus(window_->impl().focusScope(), next);
}

} // namespace platform
