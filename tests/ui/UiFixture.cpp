#include "tests/ui/UiFixture.h"

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

std::unique_ptr<UiEnvironment>& environmentSlot() {
    static std::unique_ptr<UiEnvironment> one;
    return one;
}

/// Ends the application while Qt's own static objects still live.
class ApplicationEnd : public testing::Environment {
public:
    void TearDown() override { environmentSlot().reset(); }
};
[[maybe_unused]] testing::Environment* const applicationEnd =
    testing::AddGlobalTestEnvironment(new ApplicationEnd);

} // namespace

UiEnvironment& UiTest::environment() {
    if (!environmentSlot())
        environmentSlot() = std::make_unique<UiEnvironment>();
    return *environmentSlot();
}

void UiTest::restartApplication() {
    stack_.reset();
    window_.reset();
    environmentSlot().reset();
    environment();
}

UiTest::UiTest() {
    application().setRightToLeft(false);
    application().setTextScale(1);
    application().setReducesMotion(false);
    givenWindow();
}

UiTest::~UiTest() {
    settle();
    stack_.reset();
    window_.reset();
    settle();
}

Window& UiTest::givenWindow(Size size, DeviceIdiom idiom) {
    window_.reset();
    application().setIdiom(idiom);
    window_ = std::make_unique<Window>(Rect{0, 0, size.width, size.height});
    window_->setRootViewController(std::make_shared<ViewController>());
    window_->makeKeyAndVisible();
    settle();
    return *window_;
}

Window& UiTest::window() {
    return *window_;
}

NavigationController& UiTest::givenStack(const std::shared_ptr<ViewController>& bottom) {
    stack_ = std::make_shared<NavigationController>();
    stack_->setViewControllers({bottom}, false);
    window_->setRootViewController(stack_);
    settle();
    return *stack_;
}

void UiTest::tap(const View& view) {
    settle();
    tapAt(view.convertToWindow(view.bounds()).center());
}

void UiTest::tapAt(Point point) {
    QTest::mouseClick(windowHandleOf(*window_), Qt::LeftButton, {}, toPoint(point));
    settle();
}

void UiTest::pressDown(Point point) {
    QTest::mousePress(windowHandleOf(*window_), Qt::LeftButton, {}, toPoint(point));
}

void UiTest::letGo(Point point) {
    QTest::mouseRelease(windowHandleOf(*window_), Qt::LeftButton, {}, toPoint(point));
    settle();
}

void UiTest::press(Key key) {
    static const std::pair<Qt::Key, Qt::KeyboardModifiers> keys[] = {
        {Qt::Key_Escape, Qt::NoModifier}, {Qt::Key_Return, Qt::NoModifier},
        {Qt::Key_Tab, Qt::NoModifier},    {Qt::Key_Backtab, Qt::ShiftModifier},
        {Qt::Key_Space, Qt::NoModifier},  {Qt::Key_Backspace, Qt::NoModifier},
        {Qt::Key_Left, Qt::AltModifier},  {Qt::Key_Left, Qt::NoModifier},
        {Qt::Key_Right, Qt::NoModifier}};
    const auto& [code, modifiers] = keys[static_cast<int>(key)];
    QTest::keyClick(windowHandleOf(*window_), code, modifiers);
    settle();
}

void UiTest::type(std::string_view text) {
    for (const char letter : text)
        QTest::keyClick(windowHandleOf(*window_), letter);
    settle();
}

void UiTest::commit(std::string_view text) {
    QInputMethodEvent event;
    event.setCommitString(toQt(text));
    QCoreApplication::sendEvent(QApplication::focusWidget(), &event);
    settle();
}

void UiTest::fingerDown(Point point) {
    QTest::touchEvent(windowHandleOf(*window_), touchScreen()).press(0, toPoint(point));
    settle();
}

void UiTest::fingerTo(Point point) {
    QTest::touchEvent(windowHandleOf(*window_), touchScreen()).move(0, toPoint(point));
    settle();
}

void UiTest::fingerUp(Point point) {
    QTest::touchEvent(windowHandleOf(*window_), touchScreen()).release(0, toPoint(point));
    settle();
}

Button* UiTest::button(std::string_view title) {
    settle();
    Button* result = nullptr;
    visit(*rootOf(*window_), [&](View& view) {
        auto* const candidate = dynamic_cast<Button*>(&view);
        if (candidate && candidate->title() == title)
            result = candidate;
        return result != nullptr;
    });
    return result;
}

std::vector<std::string> UiTest::buttonTitles() {
    settle();
    std::vector<std::string> titles;
    visit(*rootOf(*window_), [&](View& view) {
        if (const auto* const each = dynamic_cast<Button*>(&view))
            titles.push_back(each->title());
        return false;
    });
    return titles;
}

Label* UiTest::label(std::string_view text) {
    settle();
    Label* result = nullptr;
    visit(*rootOf(*window_), [&](View& view) {
        auto* const candidate = dynamic_cast<Label*>(&view);
        if (candidate && candidate->text() == text)
            result = candidate;
        return result != nullptr;
    });
    return result;
}

std::string UiTest::focusedTitle() {
    const QWidget* const focused = QApplication::focusWidget();
    const auto* const owner = focused ? dynamic_cast<Button*>(viewOf(focused)) : nullptr;
    return owner ? owner->title() : "";
}

std::shared_ptr<ViewController> UiTest::topPresented() {
    std::shared_ptr<ViewController> top;
    for (auto next = window_->rootViewController()->presentedViewController(); next;
         next = next->presentedViewController())
        top = next;
    return top;
}

TestScreen::TestScreen(std::string screenName, Journal& journal)
    : name(std::move(screenName)), journal_(journal) {
    setTitle(name);
}

TestScreen::~TestScreen() = default;

void TestScreen::note(std::string_view what) {
    journal_.push_back(name + " " + std::string(what));
}

void TestScreen::viewDidLoad() {
    note("didLoad");
}

void TestScreen::viewWillAppear(bool /*animated*/) {
    note("willAppear");
    if (onWillAppear)
        onWillAppear();
}

void TestScreen::viewDidAppear(bool /*animated*/) {
    note("didAppear");
}

void TestScreen::viewWillDisappear(bool /*animated*/) {
    note("willDisappear");
}

void TestScreen::viewDidDisappear(bool /*animated*/) {
    note("didDisappear");
}

} // namespace test
