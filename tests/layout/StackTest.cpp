#include "platform/ui/layout/StackConstraints.h"
#include "tests/layout/Scene.h"

#include <gmock/gmock.h>

using namespace test;
using enum platform::LayoutAttribute;
using platform::StackAlignment;
using platform::StackDistribution;
using ::testing::IsEmpty;

namespace {

/// A stack that fills a window of 200 by 100, with three labels: 30 x 10, 40 x 20, 50 x 30.
class Stack : public ::testing::Test {
protected:
    Stack() {
        for (const auto edge : {leading, trailing, top, bottom})
            tie(stack, edge, scene.root, edge);
        rules.spacing = 5;
    }
    ~Stack() override { EXPECT_THAT(scene.log, IsEmpty()); }
    void show(std::initializer_list<Item*> shown) {
        const std::vector<platform::LayoutItem*> items(shown.begin(), shown.end());
        lines.arrange(stack, items, rules);
        scene.engine.solve();
    }

    Scene scene{{200, 100}};
    Item& stack = scene.add("stack");
    Item& a = scene.label("a", {30, 10}, stack);
    Item& b = scene.label("b", {40, 20}, stack);
    Item& c = scene.label("c", {50, 30}, stack);
    platform::StackRules rules;
    platform::StackConstraints lines;
};

TEST_F(Stack, FillsItsLengthByTheWeakestHugging) {
    b.hugX = 249;
    show({&a, &b, &c});
    EXPECT_EQ(a.frame, (Rect{0, 0, 30, 100}));
    EXPECT_EQ(b.frame, (Rect{35, 0, 110, 100}));
    EXPECT_EQ(c.frame, (Rect{150, 0, 50, 100}));
    scene.engine.setRightToLeft(true);
    scene.engine.solve();
    EXPECT_EQ(a.frame, (Rect{170, 0, 30, 100}));
    EXPECT_EQ(c.frame, (Rect{0, 0, 50, 100}));
}

TEST_F(Stack, SharesItsLengthEqually) {
    rules.distribution = StackDistribution::fillEqually;
    rules.alignment = StackAlignment::center;
    show({&a, &b});
    EXPECT_EQ(a.frame, (Rect{0, 45, 98, 10}));
    EXPECT_EQ(b.frame, (Rect{103, 40, 97, 20}));
}

TEST_F(Stack, ClosesTheGapOfWhatIsHidden) {
    rules.axis = Axis::vertical;
    rules.alignment = StackAlignment::trailing;
    show({&a, &b, &c});
    EXPECT_EQ(b.frame, (Rect{160, 15, 40, 20}));
    EXPECT_EQ(c.frame, (Rect{150, 40, 50, 60}));
    show({&a, &c});
    EXPECT_EQ(c.frame, (Rect{150, 15, 50, 85}));
    show({});
    show({&c, &a});
    EXPECT_EQ(c.frame, (Rect{150, 0, 50, 85}));
    rules.alignment = StackAlignment::leading;
    rules.spacing = 20;
    show({&c, &a});
    EXPECT_EQ(c.frame, (Rect{0, 0, 50, 70}));
    EXPECT_EQ(a.frame, (Rect{0, 90, 30, 10}));
}

TEST_F(Stack, AlignsWithinWhatIsRequired) {
    rules.axis = Axis::vertical;
    show({&a, &b, &c});
    relate(a, leading, LayoutRelation::greaterOrEqual, stack, leading, 8);
    tie(b, leading, scene.root, leading, -3);
    fix(b, width, 210);
    rules.alignment = StackAlignment::leading;
    show({&a, &b, &c});
    EXPECT_EQ(a.frame, (Rect{8, 0, 30, 10}));
    EXPECT_EQ(b.frame, (Rect{-3, 15, 210, 20}));
    EXPECT_EQ(c.frame, (Rect{0, 40, 50, 60}));
}

TEST_F(Stack, IsAsLargeAsItsContentWhereNothingElseSays) {
    Item& inner = scene.add("inner", stack);
    Item& x = scene.label("x", {60, 10}, inner);
    Item& y = scene.label("y", {20, 12}, inner);
    platform::StackConstraints inside;
    const std::vector<platform::LayoutItem*> both{&x, &y};
    inside.arrange(inner, both,
                   {Axis::vertical, StackDistribution::fill, StackAlignment::center, 3});
    tie(inner, centerX, stack, centerX);
    tie(inner, top, stack, top, 7);
    EXPECT_EQ(scene.frame("inner"), (Rect{70, 7, 60, 25}));
    EXPECT_EQ(scene.frame("y"), (Rect{20, 13, 20, 12}));
}

TEST_F(Stack, ForgetsAnItemThatDied) {
    show({&a, &b});
    scene.items.erase("b");
    Item& fresh = scene.label("fresh", {10, 10}, stack);
    show({&a, &fresh});
    EXPECT_EQ(a.frame.width, 30);
    EXPECT_EQ(fresh.frame, (Rect{35, 0, 165, 100}));
}

} // namespace
