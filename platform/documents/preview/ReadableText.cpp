#include "platform/documents/preview/ReadableText.h"

#include <QAccessible>
#include <QAccessibleWidget>
#include <QString>
#include <QWidget>

namespace platform {
namespace {

/// A text that can be read but not changed, nor selected: the widget has no caret.
class ShownText final : public QAccessibleWidget, public QAccessibleTextInterface {
public:
    ShownText(QWidget& widget, const ReadableText& source)
        : QAccessibleWidget(&widget, QAccessible::EditableText), source_(source) {}

    QAccessible::Role role() const override {
        return source_.readableText().isEmpty() ? QAccessible::Client : QAccessible::EditableText;
    }

    void* interface_cast(QAccessible::InterfaceType type) override {
        return type == QAccessible::TextInterface ? static_cast<QAccessibleTextInterface*>(this)
                                                  : QAccessibleWidget::interface_cast(type);
    }
    QAccessible::State state() const override {
        QAccessible::State state = QAccessibleWidget::state();
        state.readOnly = true;
        state.multiLine = true;
        return state;
    }

    using QAccessibleWidget::text;
    QString text(int start, int end) const override {
        const QString all = source_.readableText();
        return all.mid(start, end < 0 ? -1 : end - start);
    }
    int characterCount() const override { return static_cast<int>(source_.readableText().size()); }
    QRect characterRect(int /*offset*/) const override { return rect(); }
    int offsetAtPoint(const QPoint& /*point*/) const override { return -1; }
    void scrollToSubstring(int /*start*/, int /*end*/) override {}
    QString attributes(int /*offset*/, int* start, int* end) const override {
        *start = 0;
        *end = characterCount();
        return {};
    }
    int cursorPosition() const override { return 0; }
    void setCursorPosition(int /*position*/) override {}
    void selection(int /*index*/, int* start, int* end) const override { *start = *end = 0; }
    int selectionCount() const override { return 0; }
    void addSelection(int /*start*/, int /*end*/) override {}
    void removeSelection(int /*index*/) override {}
    void setSelection(int /*index*/, int /*start*/, int /*end*/) override {}

private:
    const ReadableText& source_;
};

QAccessibleInterface* makeTextInterface(const QString& /*className*/, QObject* object) {
    auto* const widget = qobject_cast<QWidget*>(object);
    const auto* const source = dynamic_cast<const ReadableText*>(object);
    return widget && source ? new ShownText(*widget, *source) : nullptr;
}

} // namespace

void installTextAccessibility() {
    // The last factory is asked first, and a new application puts its own behind ours.
    QAccessible::removeFactory(makeTextInterface);
    QAccessible::installFactory(makeTextInterface);
}

} // namespace platform
