#include "tests/ui/Person.h"

#include "platform/ui/qt/Bridge.h"

#include <QApplication>
#include <QInputMethodEvent>
#include <QPointer>
#include <QPointingDevice>
#include <QTest>
#include <QWidget>
#include <QWindow>

#include <functional>

namespace test {

using namespace platform;

namespace {

QPoint toPoint(Point point) {
    return {static_cast<int>(point.x), static_cast<int>(point.y)};
}

QWindow* windowHandleOf(Window& window) {
    const auto root = window.rootViewController();
    return widgetOf(*root->view())->window()->windowHandle();
}

QPointingDevice* touchScreen() {
    // An application takes its devices along.
    static QPointer<QPointingDevice> device;
    if (!device)
        device = QTest::createTouchDevice();
    return device;
}

View* rootOf(Window& window) {
    View* view = window.rootViewController()->view().get();
    while (view->superview())
        view = view->superview();
    return view;
}

/// The front ones first.
bool visit(View& view, const std::function<bool(View&)>& found) {
    if (view.isHidden())
        return false;
    const auto children = view.subviews();
    for (auto each = children.rbegin(); each != children.rend(); ++each)
        if (visit(**each, found))
            return true;
    return found(view);
}

} // namespace

void Person::tap(const View& view) {
    settle();
    tapAt(view.convertToWindow(view.bounds()).center());
}

void Person::tapAt(Point point) {
    QTest::mouseClick(windowHandleOf(window()), Qt::LeftButton, {}, toPoint(point));
    settle();
}

void Person::pressDown(Point point) {
    QTest::mousePress(windowHandleOf(window()), Qt::LeftButton, {}, toPoint(point));
}

void Person::letGo(Point point) {
    QTest::mouseRelease(windowHandleOf(window()), Qt::LeftButton, {}, toPoint(point));
    settle();
}

void Person::press(Key key) {
    static const std::pair<Qt::Key, Qt::KeyboardModifiers> keys[] = {
        {Qt::Key_Escape, Qt::NoModifier}, {Qt::Key_Return, Qt::NoModifier},
        {Qt::Key_Tab, Qt::NoModifier},    {Qt::Key_Backtab, Qt::ShiftModifier},
        {Qt::Key_Space, Qt::NoModifier},  {Qt::Key_Backspace, Qt::NoModifier},
        {Qt::Key_Left, Qt::AltModifier},  {Qt::Key_Left, Qt::NoModifier},
        {Qt::Key_Right, Qt::NoModifier}};
    const auto& [code, modifiers] = keys[static_cast<int>(key)];
    QTest::keyClick(windowHandleOf(window()), code, modifiers);
    settle();
}

void Person::type(std::string_view text) {
    for (const char letter : text)
        QTest::keyClick(windowHandleOf(window()), letter);
    settle();
}

void Person::commit(std::string_view text) {
    QInputMethodEvent event;
    event.setCommitString(toQt(text));
    QCoreApplication::sendEvent(QApplication::focusWidget(), &event);
    settle();
}

void Person::fingerDown(Point point) {
    QTest::touchEvent(windowHandleOf(window()), touchScreen()).press(0, toPoint(point));
    settle();
}

void Person::fingerTo(Point point) {
    QTest::touchEvent(windowHandleOf(window()), touchScreen()).move(0, toPoint(point));
    settle();
}

void Person::fingerUp(Point point) {
    QTest::touchEvent(windowHandleOf(window()), touchScreen()).release(0, toPoint(point));
    settle();
}

Button* Person::button(std::string_view title) {
    settle();
    Button* result = nullptr;
    visit(*rootOf(window()), [&](View& view) {
        auto* const candidate = dynamic_cast<Button*>(&view);
        if (candidate && candidate->title() == title)
            result = candidate;
        return result != nullptr;
    });
    return result;
}

std::vector<std::string> Person::buttonTitles() {
    settle();
    std::vector<std::string> titles;
    visit(*rootOf(window()), [&](View& view) {
        if (const auto* const each = dynamic_cast<Button*>(&view))
            titles.push_back(each->title());
        return false;
    });
    return titles;
}

Label* Person::label(std::string_view text) {
    settle();
    Label* result = nullptr;
    visit(*rootOf(window()), [&](View& view) {
        auto* const candidate = dynamic_cast<Label*>(&view);
        if (candidate && candidate->text() == text)
            result = candidate;
        return result != nullptr;
    });
    return result;
}

std::string Person::focusedTitle() {
    const QWidget* const focused = QApplication::focusWidget();
    const auto* const owner = focused ? dynamic_cast<Button*>(viewOf(focused)) : nullptr;
    return owner ? owner->title() : "";
}

std::shared_ptr<ViewController> Person::topPresented() {
    std::shared_ptr<ViewController> top;
    for (auto next = window().rootViewController()->presentedViewController(); next;
         next = next->presentedViewController())
        top = next;
    return top;
}

} // namespace test
