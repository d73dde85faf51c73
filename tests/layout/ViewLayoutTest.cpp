#include "platform/base/Log.h"
#include "platform/ui/Controls.h"
#include "platform/ui/StackView.h"
#include "platform/ui/VisualFormat.h"
#include "tests/ui/UiEnvironment.h"

#include <gmock/gmock.h>

#include <ostream>

namespace platform {
std::ostream& operator<<(std::ostream& out, const Rect& r) {
    return out << r.x << ", " << r.y << ", " << r.width << ", " << r.height;
}
} // namespace platform

using namespace platform;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

namespace {

/// Real views in a real window, 300 points wide below the status strip.
class ViewLayout : public ::testing::Test {
protected:
    ViewLayout() {
        setLogSink({[](int level) { return level <= 4; },
                    [this](int, std::string message, const std::source_location&) {
                        log.push_back(std::move(message));
                    }});
        environment.application->setIdiom(DeviceIdiom::phone);
        screen->view()->addSubview(stack);
        stack->setLaidOutByConstraints(true);
        for (const auto edge :
             {LayoutAttribute::leading, LayoutAttribute::trailing, LayoutAttribute::top})
            LayoutConstraint::equal(*stack, edge, *screen->view(), edge)->setActive(true);
        stack->setAxis(Axis::vertical);
        window.setRootViewController(screen);
        window.makeKeyAndVisible();
    }
    ~ViewLayout() override {
        setLogSink({});
        EXPECT_THAT(log, IsEmpty());
    }
    std::shared_ptr<View> box(double height) {
        auto view = std::make_shared<View>();
        LayoutConstraint::constant(*view, LayoutAttribute::height, LayoutRelation::equal, height)
            ->setActive(true);
        return view;
    }
    Rect laidOut(View& view) {
        window.layoutIfNeeded();
        return view.frame();
    }

    test::UiEnvironment environment;
    std::vector<std::string> log;
    Window window{{0, 0, 360, 640}};
    std::shared_ptr<ViewController> screen = std::make_shared<ViewController>();
    std::shared_ptr<StackView> stack = std::make_shared<StackView>();
};

TEST_F(ViewLayout, StackFollowsWhatIsHiddenAddedAndRemoved) {
    const auto a = box(10), b = box(20), c = box(30);
    stack->setSpacing(5);
    for (const auto& view : {a, b, c})
        stack->addArrangedSubview(view);
    const double width = laidOut(*stack).width;
    EXPECT_EQ(laidOut(*c), (Rect{0, 40, width, 30}));
    b->setHidden(true);
    EXPECT_EQ(laidOut(*c).y, 15);
    EXPECT_EQ(stack->frame().height, 45);
    b->setHidden(false);
    a->removeFromSuperview();
    EXPECT_THAT(stack->arrangedSubviews(), ElementsAre(b, c));
    EXPECT_EQ(laidOut(*c).y, 25);
    stack->addArrangedSubview(b);
    EXPECT_EQ(laidOut(*b).y, 35);
    stack->removeArrangedSubview(stack->arrangedSubviews().front());
    EXPECT_EQ(c->superview(), nullptr);
    EXPECT_EQ(laidOut(*b).y, 0);
}

TEST_F(ViewLayout, TextWrapsInItsStack) {
    const auto text = std::make_shared<Label>();
    text->setText("A text of so many words that no window of a telephone has room for one line.");
    text->setNumberOfLines(0);
    stack->addArrangedSubview(text);
    const double wrapped = laidOut(*text).height;
    window.resize({1400, 700});
    EXPECT_LT(laidOut(*text).height * 2, wrapped + 1);
    EXPECT_EQ(stack->frame().height, text->frame().height);
}

TEST_F(ViewLayout, FormatLinesViewsUpAndKeepsNone) {
    const auto row = box(40);
    stack->addArrangedSubview(row);
    const auto name = std::make_shared<View>();
    auto value = std::make_shared<View>();
    for (const auto& view : {name, value}) {
        view->setLaidOutByConstraints(true);
        row->addSubview(view);
    }
    const auto made = constraintsWithVisualFormat("|-[name(70)]-10-[value]|",
                                                  {{"name", name.get()}, {"value", value.get()}});
    ASSERT_TRUE(made.ok());
    LayoutConstraint::activate(*made);
    EXPECT_EQ(laidOut(*value).x, 88);
    EXPECT_EQ(value->frame().width, row->frame().width - 88);
    EXPECT_EQ(made->back()->secondView(), value.get());
    value->removeFromSuperview();
    value.reset();
    EXPECT_FALSE(made->back()->isActive());
    EXPECT_EQ(made->back()->secondView(), nullptr);
    EXPECT_EQ(laidOut(*name).width, 70);
    EXPECT_FALSE(constraintsWithVisualFormat("[name]-[gone]", {{"name", name.get()}}).ok());
}

} // namespace
