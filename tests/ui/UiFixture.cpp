#include "tests/ui/UiFixture.h"

namespace test {

using namespace platform;

namespace {

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
