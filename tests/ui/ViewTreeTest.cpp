#include "platform/ui/Canvas.h"
#include "platform/ui/ShapeLayer.h"
#include "platform/ui/StackView.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"
#include "tests/ui/UiFixture.h"

#include <QWidget>

namespace test {
namespace {

using namespace platform;

/// Makes a subview in its own constructor and counts what it is told.
class Composite : public View {
public:
    Composite() : inner(std::make_shared<Label>()) { addSubview(inner); }

    std::shared_ptr<Label> inner;
    int layouts = 0;
    int moves = 0;

protected:
    void layoutSubviews() override {
        ++layouts;
        inner->setFrame(bounds().inset(10, 10));
    }
    void didMoveToWindow() override { ++moves; }
};

class ViewTreeTest : public UiTest {
protected:
    View& page() { return *window().rootViewController()->view(); }
};

TEST_F(ViewTreeTest, ViewsMayDieInAnyOrder) {
    auto parent = std::make_shared<View>();
    auto child = std::make_shared<View>();
    auto grandchild = std::make_shared<Button>(ButtonType::system);
    parent->addSubview(child);
    child->addSubview(grandchild);
    page().addSubview(parent);
    EXPECT_EQ(grandchild->window(), &window());
    child->removeFromSuperview();
    parent.reset();
    EXPECT_EQ(grandchild->window(), nullptr);
    child.reset();
    EXPECT_EQ(grandchild->superview(), nullptr);
    page().addSubview(grandchild);
    EXPECT_EQ(grandchild->window(), &window());
    givenWindow();
    EXPECT_EQ(grandchild->window(), nullptr) << "its window is gone, it is not";
    page().addSubview(grandchild);
    EXPECT_EQ(page().subviews().size(), 1U);
}

TEST_F(ViewTreeTest, APressMayTakeAwayTheButtonAndAllThatHoldsIt) {
    auto card = std::make_shared<View>(Rect{0, 0, 300, 300});
    auto close = std::make_shared<Button>(ButtonType::system, Rect{10, 10, 100, 44});
    const std::weak_ptr<Button> watched = close;
    close->addAction(ControlEvent::touchUpInside, [&] {
        card->removeFromSuperview();
        card.reset();
    });
    card->addSubview(close);
    page().addSubview(card);
    const Point middle = close->convertToWindow(close->bounds()).center();
    close.reset();
    tapAt(middle);
    EXPECT_EQ(card, nullptr);
    EXPECT_TRUE(watched.expired());
}

TEST_F(ViewTreeTest, AWidgetThatDiesFirstLeavesAViewThatStillAnswers) {
    auto view = std::make_shared<WidgetView>(std::make_unique<QWidget>());
    page().addSubview(view);
    delete widgetOf(*view);
    view->setFrame({1, 2, 3, 4});
    view->setHidden(true);
    view->setAlpha(0.5);
    auto label = std::make_shared<Label>();
    view->addSubview(label);
    settle();
    EXPECT_EQ(view->frame(), (Rect{1, 2, 3, 4}));
    view->removeFromSuperview();
    EXPECT_EQ(label->window(), nullptr);
}

TEST_F(ViewTreeTest, AWrappedWidgetTakesPartInLayout) {
    auto view = std::make_shared<WidgetView>(std::make_unique<QWidget>());
    view->setIntrinsicSize([] { return Size{120, noIntrinsicMetric}; });
    view->setHeightForWidth([](double width) { return width / 2; });
    auto row = std::make_shared<StackView>(std::vector<std::shared_ptr<View>>{view});
    row->setLaidOutByConstraints(true);
    page().addSubview(row);
    LayoutConstraint::activate(
        {LayoutConstraint::equal(*row, LayoutAttribute::leading, page(), LayoutAttribute::leading,
                                 16),
         LayoutConstraint::equal(*row, LayoutAttribute::top, page(), LayoutAttribute::top, 8)});
    settle();
    EXPECT_EQ(view->convertToWindow(view->bounds()), (Rect{16, 28, 120, 60}));
    EXPECT_EQ(viewOf(widgetOf(*view)), view.get());
}

TEST_F(ViewTreeTest, LayoutRunsOnceATurnHoweverMuchChanges) {
    auto view = std::make_shared<Composite>();
    page().addSubview(view);
    EXPECT_EQ(view->moves, 1);
    settle();
    const int before = view->layouts;
    for (int i = 1; i <= 5; ++i)
        view->setFrame({0, 0, 100.0 * i, 50});
    EXPECT_EQ(view->layouts, before);
    settle();
    EXPECT_EQ(view->layouts, before + 1);
    EXPECT_EQ(view->inner->frame(), (Rect{10, 10, 480, 30}));
    view->setNeedsLayout();
    view->layoutIfNeeded();
    EXPECT_EQ(view->layouts, before + 2);
    EXPECT_FALSE(window().layoutIfNeeded());
}

TEST_F(ViewTreeTest, AHiddenViewNeitherShowsNorTakesTapsNorRoomInAStack) {
    auto first = std::make_shared<Button>(ButtonType::system);
    auto second = std::make_shared<Button>(ButtonType::system);
    first->setTitle("First");
    second->setTitle("Second");
    first->addAction(ControlEvent::touchUpInside, [this] { journal.push_back("first"); });
    auto column = std::make_shared<StackView>(std::vector<std::shared_ptr<View>>{first, second});
    column->setAxis(Axis::vertical);
    column->setSpacing(10);
    column->setLaidOutByConstraints(true);
    page().addSubview(column);
    LayoutConstraint::activate(
        {LayoutConstraint::equal(*column, LayoutAttribute::leading, page(),
                                 LayoutAttribute::leading),
         LayoutConstraint::equal(*column, LayoutAttribute::top, page(), LayoutAttribute::top)});
    settle();
    EXPECT_EQ(second->frame().y, 54);
    first->setHidden(true);
    settle();
    EXPECT_EQ(second->frame().y, 0);
    tap(*first);
    EXPECT_TRUE(journal.empty());
}

TEST_F(ViewTreeTest, LeadingEdgesMirrorWithTheDirectionWhileTheProgramRuns) {
    auto view = std::make_shared<View>();
    view->setLaidOutByConstraints(true);
    page().addSubview(view);
    LayoutConstraint::activate(
        {LayoutConstraint::equal(*view, LayoutAttribute::leading, page(), LayoutAttribute::leading,
                                 16),
         LayoutConstraint::equal(*view, LayoutAttribute::top, page(), LayoutAttribute::top),
         LayoutConstraint::constant(*view, LayoutAttribute::width, LayoutRelation::equal, 100),
         LayoutConstraint::constant(*view, LayoutAttribute::height, LayoutRelation::equal, 20)});
    settle();
    EXPECT_EQ(view->frame().x, 16);
    application().setRightToLeft(true);
    settle();
    EXPECT_EQ(view->frame().x, 390 - 16 - 100);
}

TEST_F(ViewTreeTest, InsertedViewsStandBelowThoseAfterThem) {
    auto front = std::make_shared<Button>(ButtonType::system, Rect{0, 0, 100, 100});
    auto back = std::make_shared<Button>(ButtonType::system, Rect{0, 0, 100, 100});
    front->addAction(ControlEvent::touchUpInside, [this] { journal.push_back("front"); });
    back->addAction(ControlEvent::touchUpInside, [this] { journal.push_back("back"); });
    page().addSubview(front);
    page().insertSubview(back, 0);
    tap(*back);
    EXPECT_EQ(journal.back(), "front");
    page().insertSubview(front, 0);
    tap(*front);
    EXPECT_EQ(journal.back(), "back");
}

TEST_F(ViewTreeTest, AHairlineIsOnePixelOfAPictureAtEveryScale) {
    auto line = std::make_shared<View>(Rect{0, 100, 390, 0.5});
    line->setBackgroundColor(Color::black);
    page().addSubview(line);
    settle();
    const QImage picture = QImage::fromData(
        [&] {
            const Bytes png = window().snapshotPng(2);
            return QByteArray(reinterpret_cast<const char*>(png.data()),
                              static_cast<qsizetype>(png.size()));
        }(),
        "PNG");
    ASSERT_EQ(picture.size(), QSize(780, 1688));
    const int top = 2 * (100 + 20);
    EXPECT_EQ(picture.pixelColor(100, top), QColor(Qt::black));
    EXPECT_EQ(picture.pixelColor(100, top + 1), QColor(Qt::white));
}

TEST_F(ViewTreeTest, LayersAreDrawnInOrderAndRepaintTheirView) {
    auto view = std::make_shared<View>(Rect{0, 0, 40, 40});
    auto disc = std::make_shared<ShapeLayer>();
    Path circle;
    circle.addOval({0, 0, 40, 40});
    disc->setPath(circle);
    disc->setFillColor(Theme::accent);
    view->addLayer(disc);
    page().addSubview(view);
    settle();
    const auto middle = [&] { return widgetOf(*view)->grab().toImage().pixelColor(20, 20); };
    EXPECT_EQ(middle(), toQt(Theme::accent));
    disc->setFillColor(Theme::destructive);
    EXPECT_EQ(middle(), toQt(Theme::destructive));
    view.reset();
    page().subviews().front()->removeFromSuperview();
    disc->setFillColor(Theme::text);
}

} // namespace
} // namespace test
