#include "platform/ui/qt/ViewWidget.h"

#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/ButtonImpl.h"
#include "platform/ui/qt/FocusOrder.h"
#include "platform/ui/qt/Settings.h"
#include "platform/ui/qt/ViewImpl.h"

#include <QAccessibleWidget>
#include <QKeyEvent>
#include <QMouseEvent>
#include <QPainter>

#include <utility>

namespace platform {
namespace {

View::Impl* implOf(const QWidget* widget) {
    View* const view = ownerOf(widget);
    return view ? &view->impl() : nullptr;
}

bool isTapKey(const QKeyEvent& event) {
    return event.key() == Qt::Key_Return || event.key() == Qt::Key_Enter ||
           event.key() == Qt::Key_Space || event.key() == Qt::Key_Select;
}

/// The role and, for what can be pressed, the press action. What is out of reach for a finger is so
/// for everybody, and says so.
class ViewAccessible : public QAccessibleWidget {
public:
    explicit ViewAccessible(QWidget* widget) : QAccessibleWidget(widget) {}

    QAccessible::Role role() const override {
        const View::Impl* const impl = implOf(widget());
        return impl ? impl->role.value_or(impl->accessibleRole()) : QAccessible::Client;
    }
    QAccessible::State state() const override {
        QAccessible::State state = QAccessibleWidget::state();
        state.modal = role() == QAccessible::Dialog;
        state.disabled = state.disabled || (canBePressed() && !isWithinReach(*widget()));
        return state;
    }
    QStringList actionNames() const override {
        QStringList names = QAccessibleWidget::actionNames();
        if (canBePressed())
            names.prepend(pressAction());
        return names;
    }
    void doAction(const QString& name) override {
        if (name != pressAction() || !canBePressed())
            QAccessibleWidget::doAction(name);
        else if (widget()->isEnabled() && isWithinReach(*widget()))
            press();
    }

protected:
    virtual bool canBePressed() const {
        const View::Impl* const impl = implOf(widget());
        return impl && !impl->tapHandlers.empty();
    }
    virtual void press() { implOf(widget())->activateTap(); }
};

/// Pressed at once, where the toolkit's own would press a moment later.
class ButtonAccessible final : public ViewAccessible {
public:
    using ViewAccessible::ViewAccessible;

protected:
    bool canBePressed() const override { return true; }
    void press() override { static_cast<ButtonWidget*>(widget())->click(); }
};

QAccessibleInterface* makeViewInterface(const QString& /*className*/, QObject* object) {
    // No class of ours has a meta-object of its own, so all of them arrive under the toolkit's
    // names.
    if (auto* const button = dynamic_cast<ButtonWidget*>(object))
        return new ButtonAccessible(button);
    auto* const view = dynamic_cast<ViewWidget*>(object);
    return view ? new ViewAccessible(view) : nullptr;
}

} // namespace

void paintFocusRing(QPainter& painter, const QRectF& bounds, double cornerRadius) {
    painter.save();
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setOpacity(1);
    painter.setBrush(Qt::NoBrush);
    painter.setPen(QPen(toQt(Theme::accent), 2));
    painter.drawRoundedRect(bounds.adjusted(1, 1, -1, -1), cornerRadius, cornerRadius);
    painter.restore();
}

void installAccessibility() {
    static bool installed = false;
    if (!std::exchange(installed, true))
        QAccessible::installFactory(makeViewInterface);
}

bool ViewWidget::event(QEvent* event) {
    if (event->type() == QEvent::FocusIn || event->type() == QEvent::FocusOut)
        update();
    return QWidget::event(event);
}

void ViewWidget::paintEvent(QPaintEvent* /*event*/) {
    View::Impl* const impl = implOf(this);
    if (!impl)
        return;
    QPainter painter(this);
    impl->paint(painter);
    if (hasFocus() && showsKeyboardFocus() && focusPolicy() != Qt::NoFocus)
        paintFocusRing(painter, rect(), Theme::buttonCorner);
}

void ViewWidget::mousePressEvent(QMouseEvent* event) {
    const View::Impl* const impl = implOf(this);
    if (!impl || impl->tapHandlers.empty() || event->button() != Qt::LeftButton)
        QWidget::mousePressEvent(event);
}

void ViewWidget::mouseReleaseEvent(QMouseEvent* event) {
    View::Impl* const impl = implOf(this);
    if (impl && !impl->tapHandlers.empty() && event->button() == Qt::LeftButton &&
        rect().contains(event->position().toPoint()))
        impl->activateTap();
    else
        QWidget::mouseReleaseEvent(event);
}

void ViewWidget::keyPressEvent(QKeyEvent* event) {
    View::Impl* const impl = implOf(this);
    // Not a key that a control inside has left alone.
    if (impl && !impl->tapHandlers.empty() && hasFocus() && isTapKey(*event))
        impl->activateTap();
    else
        QWidget::keyPressEvent(event);
}

} // namespace platform
