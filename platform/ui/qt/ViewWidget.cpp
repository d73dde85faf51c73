#include "platform/ui/qt/ViewWidget.h"

#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"
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

/// The role and, for a view that can be tapped, the press action.
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
        return state;
    }
    QStringList actionNames() const override {
        const View::Impl* const impl = implOf(widget());
        QStringList names = QAccessibleWidget::actionNames();
        if (impl && !impl->tapHandlers.empty())
            names.prepend(pressAction());
        return names;
    }
    void doAction(const QString& name) override {
        View::Impl* const impl = implOf(widget());
        if (impl && name == pressAction())
            impl->activateTap();
        else
            QAccessibleWidget::doAction(name);
    }
};

QAccessibleInterface* makeInterface(const QString& className, QObject* object) {
    // No class of ours has a meta-object of its own, so all of them arrive as plain widgets.
    if (className != QLatin1String("QWidget") || !object || !object->isWidgetType())
        return nullptr;
    if (auto* const widget = dynamic_cast<ViewWidget*>(object))
        return new ViewAccessible(widget);
    return nullptr;
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
        QAccessible::installFactory(makeInterface);
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
