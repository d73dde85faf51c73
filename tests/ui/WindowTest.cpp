#include "platform/ui/qt/RestorationFile.h"
#include "platform/ui/qt/WindowImpl.h"
#include "tests/support/TemporaryFolder.h"
#include "tests/ui/UiFixture.h"

#include <QIcon>

#include <gmock/gmock.h>

#include <algorithm>
#include <thread>

namespace test {
namespace {

using namespace platform;
using testing::ElementsAre;
using testing::HasSubstr;

class WindowTest : public UiTest {
protected:
    std::shared_ptr<Observation> noting(std::string_view name) {
        return std::make_shared<Observation>(environment().notifications.observe(
            name, [this](const Notification& notice) { journal.emplace_back(notice.name); }));
    }
};

/// Writes down the size and the traits with which it is told of a change.
class ResizableScreen : public ViewController {
public:
    void viewWillTransitionToSize(Size size, TransitionCoordinator& coordinator) override {
        ViewController::viewWillTransitionToSize(size, coordinator);
        announced = size;
        before = traitCollection();
        coordinator.animateAlongside([this] { during = traitCollection(); },
                                     [this] { laidOut = view()->frame().size(); });
    }

    std::optional<Size> announced;
    TraitCollection before;
    TraitCollection during;
    Size laidOut;
};

TEST_F(WindowTest, ItsSizeFollowsTheDeviceUnlessItIsGiven) {
    EXPECT_EQ(givenWindow({0, 0}).size().width, 390);
    const Rect screen = application().mainScreenBounds();
    const Window& whole = givenWindow(screen.size(), DeviceIdiom::tablet);
    EXPECT_EQ(whole.size().width, std::min(1024.0, screen.width));
    EXPECT_EQ(givenWindow({500, 600}).size(), (Size{500, 600}));
    givenWindow({100, 100});
    EXPECT_EQ(window().size(), (Size{320, 480}));
    window().resize({200, 100});
    EXPECT_EQ(window().size(), (Size{480, 320}));
}

TEST_F(WindowTest, BroughtForwardItIsNoLongerMinimised) {
    QWidget& top = *window().impl().widget;
    top.showMinimized();
    settle();
    ASSERT_TRUE(top.isMinimized());
    application().bringForward("");
    settle();
    EXPECT_FALSE(top.isMinimized());
    EXPECT_TRUE(top.isActiveWindow());
    window().close();
    application().bringForward("a token");
    EXPECT_FALSE(window().isVisible()) << "whoever closed it has the last word";
}

TEST_F(WindowTest, AResizeIsAnnouncedWithTheOldTraitsAndEndsWithTheNewOnes) {
    const auto screen = std::make_shared<ResizableScreen>();
    window().setRootViewController(screen);
    EXPECT_EQ(screen->announced, std::nullopt) << "the first size is no change";
    window().resize({844, 390});
    EXPECT_EQ(screen->announced, (Size{844, 390}));
    EXPECT_EQ(screen->before, (TraitCollection{SizeClass::compact, SizeClass::regular}));
    EXPECT_EQ(screen->during, (TraitCollection{SizeClass::regular, SizeClass::compact}));
    EXPECT_EQ(screen->laidOut, (Size{844, 370}));
    EXPECT_EQ(window().orientation(), Orientation::landscapeLeft);
}

TEST_F(WindowTest, TheSizesChangeReachesTheScreensOfAStackAndThosePresented) {
    const auto inner = std::make_shared<ResizableScreen>();
    auto& stack = givenStack(inner);
    const auto over = std::make_shared<ResizableScreen>();
    over->setModalPresentationStyle(PresentationStyle::overCurrentContext);
    stack.presentViewController(over, false);
    window().resize({700, 900});
    EXPECT_TRUE(inner->announced);
    EXPECT_TRUE(over->announced);
    EXPECT_EQ(over->view()->frame(), (Rect{0, 20, 700, 880}));
}

TEST_F(WindowTest, TheStripNamesAccountAndNetworkAndTurnsWhileThereIsActivity) {
    window().setStatusStrip({"anna@example.org", "Wi-Fi", true});
    EXPECT_NE(label("anna@example.org"), nullptr);
    EXPECT_NE(label("Wi-Fi"), nullptr);
    EXPECT_EQ(window().statusBarFrame(), (Rect{0, 0, 390, 20}));
    const Bytes before = window().snapshotPng();
    advance(100ms);
    EXPECT_NE(window().snapshotPng(), before);
    application().setTextScale(2);
    EXPECT_GE(window().statusBarFrame().height, 31) << "its text is not cut";
}

TEST_F(WindowTest, TheMainQueueIsDrainedFromTheLoopWhereverAJobComesFrom) {
    bool ran = false;
    std::thread([&] { environment().mainQueue.async([&] { ran = true; }); }).join();
    EXPECT_FALSE(ran);
    application().processPending();
    EXPECT_TRUE(ran);
    environment().mainQueue.after(2s, [this] { journal.push_back("later"); });
    advance(1999ms);
    EXPECT_TRUE(journal.empty());
    advance(1ms);
    EXPECT_THAT(journal, ElementsAre("later"));
}

TEST_F(WindowTest, ActivityIsAnnouncedWhenItChanges) {
    application().setActive(true);
    const auto active = noting(applicationDidBecomeActiveNotification);
    const auto inactive = noting(applicationWillResignActiveNotification);
    application().setActive(true);
    application().setActive(false);
    application().setActive(false);
    application().setActive(true);
    EXPECT_THAT(journal, ElementsAre(applicationWillResignActiveNotification,
                                     applicationDidBecomeActiveNotification));
}

TEST_F(WindowTest, AScreenOfStaticLifeOutlivesOneApplicationAndServesTheNext) {
    const auto kept = std::make_shared<TestScreen>("Kept", journal);
    window().setRootViewController(kept);
    settle();
    restartApplication();
    kept->view()->setFrame({0, 0, 10, 10});
    givenWindow();
    const auto fresh = std::make_shared<ViewController>();
    auto stack = std::make_shared<NavigationController>();
    window().setRootViewController(stack);
    stack->pushViewController(fresh, false);
    stack->pushViewController(kept, true);
    advance(280ms);
    EXPECT_EQ(stack->topViewController(), kept);
    EXPECT_EQ(kept->view()->window(), &window());
    EXPECT_EQ(std::ranges::count(journal, "Kept didLoad"), 2) << "its widgets went with the first";
}

TEST_F(WindowTest, IconsAreFoundWithoutADesktop) {
    EXPECT_FALSE(QIcon::fromTheme(QStringLiteral("application-pdf")).isNull());
    EXPECT_FALSE(Image::named("Cloudload").empty());
    EXPECT_TRUE(Image::named("NoSuchPicture").empty());
}

TEST_F(WindowTest, RestorationValuesSurviveTheirFile) {
    const TemporaryFolder folder;
    const std::string path = folder / "state/restoration.json";
    const Value::Map values = {
        {"Root", Value::Map{{"url", Url::file("/store/A%20b/Ü.pdf")},
                            {"PreviewMode", 1},
                            {"fraction", 0.25},
                            {"when", Date{1'700'000'000'123'456'789}},
                            {"list", Value::List{true, "text", Value()}},
                            {"bytes", Bytes{std::byte{0}, std::byte{255}}}}}};
    ASSERT_FALSE(writeRestorationFile(path, values));
    EXPECT_EQ(Value(readRestorationFile(path)), Value(values));
    folder.write("state/restoration.json", "{ torn");
    EXPECT_TRUE(readRestorationFile(path).empty());
    EXPECT_TRUE(writeRestorationFile("/proc/none/restoration.json", values));
}

} // namespace
} // namespace test
