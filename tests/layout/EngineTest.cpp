#include "tests/layout/Scene.h"

#include <gmock/gmock.h>

#include <random>

using namespace test;
using enum platform::LayoutAttribute;
using enum platform::LayoutRelation;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

namespace {

void pinEdges(Item& item, double inset) {
    tie(item, leading, *item.parent, leading, inset);
    tie(item, trailing, *item.parent, trailing, -inset);
    tie(item, top, *item.parent, top, inset);
    tie(item, bottom, *item.parent, bottom, -inset);
}

TEST(Engine, FollowsTheRootAndItsConstants) {
    Scene scene({300, 200});
    Item& box = scene.add("box");
    pinEdges(box, 8);
    Item& inner = scene.add("inner", box);
    tie(inner, centerX, box, centerX);
    const auto down = tie(inner, top, box, top, 5);
    relate(inner, width, equal, box, width, -4, 0.5);
    relate(inner, height, equal, inner, width, 0, 0.25);
    EXPECT_EQ(scene.frame("box"), (Rect{8, 8, 284, 184}));
    EXPECT_EQ(scene.frame("inner"), (Rect{73, 5, 138, 35}));
    scene.engine.setRootSize({220, 100});
    down->setConstant(-3);
    EXPECT_EQ(scene.frame("inner"), (Rect{53, -3, 98, 25}));
    EXPECT_EQ(box.timesPlaced, 2);
    EXPECT_FALSE(scene.engine.needsSolve());
}

TEST(Engine, WeighsHuggingAgainstCompression) {
    Scene scene({200, 100});
    Item& name = scene.label("name", {60, 10});
    Item& value = scene.label("value", {50, 10});
    tie(name, leading, scene.root, leading);
    tie(value, leading, name, trailing, 10);
    tie(value, trailing, scene.root, trailing);
    name.hugX = 251;
    value.resistX = 250;
    EXPECT_EQ(scene.frame("name").width, 60);
    EXPECT_EQ(scene.frame("value"), (Rect{70, 0, 130, 10}));
    scene.engine.setRootSize({100, 100});
    EXPECT_EQ(scene.frame("value"), (Rect{70, 0, 30, 10}));
    name.resistX = 249;
    scene.engine.itemChanged(name);
    EXPECT_EQ(scene.frame("name").width, 40);
    value.natural.width = 200;
    value.resistX = 1000;
    scene.engine.itemChanged(value);
    EXPECT_EQ(scene.frame("name").width, 0);
    EXPECT_EQ(scene.frame("value"), (Rect{10, 0, 90, 10}));
    EXPECT_THAT(scene.log, IsEmpty());
}

TEST(Engine, HigherPriorityBeatsAnySumOfLower) {
    Scene scene;
    Item& box = scene.add("box");
    for (int i = 0; i < 200; ++i)
        fix(box, width, 100, 749.5F);
    const auto strong = fix(box, width, 40, 750);
    EXPECT_EQ(scene.frame("box").width, 40);
    strong->setPriority(749);
    EXPECT_EQ(scene.frame("box").width, 100);
    fix(box, width, 70, 1000, lessOrEqual);
    fix(box, width, 20, 1000, greaterOrEqual);
    EXPECT_EQ(scene.frame("box").width, 70);
}

TEST(Engine, GivesATextTheHeightOfItsWidth) {
    Scene scene({120, 300});
    Item& text = scene.text("text", 500);
    Item& below = scene.label("below", {40, 12});
    tie(text, leading, scene.root, leading, 10);
    tie(text, trailing, scene.root, trailing, -10);
    tie(text, top, scene.root, top);
    tie(below, top, text, bottom, 4);
    EXPECT_EQ(scene.frame("text"), (Rect{10, 0, 100, 50}));
    EXPECT_EQ(scene.frame("below").y, 54);
    scene.engine.setRootSize({270, 300});
    EXPECT_EQ(scene.frame("text"), (Rect{10, 0, 250, 20}));
    EXPECT_EQ(scene.frame("below").y, 24);
    // The same height as before has to be found again after a change of the text.
    scene.engine.itemChanged(text);
    EXPECT_EQ(scene.frame("text").height, 20);
    text.heightForWidth = nullptr;
    scene.engine.itemChanged(text);
    EXPECT_EQ(scene.frame("text").height, 10);
}

TEST(Engine, EndsWhenHeightAndWidthChaseEachOther) {
    Scene scene;
    Item& text = scene.text("text", 500);
    relate(text, width, equal, text, height, 0, 2);
    const Rect frame = scene.frame("text");
    EXPECT_EQ(frame.width, frame.height * 2);
    EXPECT_FALSE(scene.engine.needsSolve());
}

TEST(Engine, MirrorsLeadingAndTrailingOnly) {
    Scene scene({300, 100});
    Item& box = scene.add("box");
    Item& inner = scene.add("inner", box);
    Item& placed = scene.add("placed");
    placed.byHand = true;
    placed.given = {20, 5, 30, 40};
    tie(box, leading, scene.root, leading, 10);
    fix(box, width, 100);
    tie(inner, left, box, left, 7);
    fix(inner, width, 50);
    Item& after = scene.add("after");
    tie(after, left, placed, right, 1);
    tie(after, trailing, scene.root, trailing, -2);
    EXPECT_EQ(scene.frame("after"), (Rect{51, 0, 247, 0}));
    scene.engine.setRightToLeft(true);
    EXPECT_EQ(scene.frame("box"), (Rect{190, 0, 100, 0}));
    EXPECT_EQ(inner.frame, (Rect{7, 0, 50, 0}));
    EXPECT_EQ(after.frame.x, 51);
    EXPECT_THAT(scene.log, ElementsAre(HasSubstr("after.trailing")));
    scene.engine.setRightToLeft(false);
    EXPECT_EQ(scene.frame("box").x, 10);
}

TEST(Engine, KeepsHandFramesAndTheirContentsApart) {
    Scene scene;
    Item& row = scene.add("row");
    row.byHand = true;
    row.given = {0.5, 40, 101, 20};
    Item& inner = scene.add("inner", row);
    pinEdges(inner, 3);
    EXPECT_EQ(scene.frame("inner"), (Rect{3, 3, 95, 14}));
    row.given.y = 90.25;
    scene.engine.itemChanged(row);
    scene.engine.solve();
    EXPECT_EQ(inner.timesPlaced, 1);
    EXPECT_EQ(row.timesPlaced, 0);
    row.given.width = 50;
    scene.engine.itemChanged(row);
    EXPECT_EQ(scene.frame("inner").width, 44);
    row.byHand = false;
    scene.engine.itemChanged(row);
    fix(row, width, 30);
    EXPECT_EQ(scene.frame("inner").width, 24);
    EXPECT_EQ(row.timesPlaced, 1);
}

TEST(Engine, RoundsToPixelsSoThatNeighboursMeet) {
    for (const double scale : {1.0, 2.0, 1.25}) {
        Scene scene({100, 100});
        scene.engine.setPixelsPerPoint(scale);
        Item* last = nullptr;
        for (int i = 0; i < 7; ++i) {
            Item& part = scene.add(std::to_string(i));
            tie(part, leading, last ? *last : scene.root, last ? trailing : leading);
            if (last)
                tie(part, width, *last, width);
            last = &part;
        }
        tie(*last, trailing, scene.root, trailing);
        scene.engine.solve();
        double edge = 0;
        for (int i = 0; i < 7; ++i) {
            const Rect frame = scene[std::to_string(i)].frame;
            EXPECT_DOUBLE_EQ(frame.x, edge);
            edge = frame.maxX();
            EXPECT_NEAR(edge * scale, std::round(edge * scale), 1e-9);
        }
        EXPECT_DOUBLE_EQ(edge, 100);
    }
}

TEST(Engine, RoundsWhatIsComputedOnTwoWaysToOnePixel) {
    Scene scene({21, 300});
    Item& part = scene.add("part");
    relate(part, width, equal, scene.root, width, 0, 1.0 / 9);
    Item& first = scene.add("first");
    relate(first, width, equal, part, width, 0, 9 * 0.5);
    Item& second = scene.add("second");
    tie(second, trailing, scene.root, trailing);
    relate(second, width, equal, scene.root, width, 0, 0.5);
    EXPECT_EQ(scene.frame("first").maxX(), scene.frame("second").x);
    Item& text = scene.text("text", 300);
    relate(text, width, equal, part, width, 0, 9);
    for (const double width : {300, 600}) {
        scene.engine.setRootSize({width, 100});
        EXPECT_EQ(scene.frame("text").height, 10) << width;
    }
}

TEST(Engine, LogsAConflictOnceAndTakesTheLoserBack) {
    Scene scene({0, 0});
    Item& box = scene.add("box");
    tie(box, leading, scene.root, leading, 8);
    tie(box, trailing, scene.root, trailing, -8);
    scene.engine.solve();
    EXPECT_THAT(scene.log, IsEmpty()) << "a window without area has no conflicts to tell";
    scene.engine.setRootSize({300, 200});
    const auto first = fix(box, height, 30);
    const auto second = fix(box, height, 50);
    const auto third = tie(box, height, scene.root, height, -160);
    EXPECT_EQ(scene.frame("box").height, 30);
    EXPECT_THAT(scene.log, ElementsAre(AllOf(HasSubstr("box.height == 50 gives way"),
                                             HasSubstr("against (box.height == 30")),
                                       HasSubstr("root.height - 160 gives way")));
    scene.engine.setRootSize({310, 210});
    scene.engine.solve();
    EXPECT_EQ(scene.log.size(), 2U);
    first->setActive(false);
    EXPECT_EQ(scene.frame("box").height, 50);
    scene.engine.setRootSize({310, 210});
    second->setActive(false);
    EXPECT_EQ(scene.frame("box").height, 50);
    EXPECT_EQ(scene.log.size(), 2U);
    fix(box, height, 51);
    EXPECT_EQ(scene.frame("box").height, 50);
    EXPECT_EQ(scene.log.size(), 3U);
}

TEST(Engine, WakesConstraintsWhenTheirViewsComeIn) {
    Scene scene;
    Item& box = scene.addAsleep("box", scene.root);
    Item& inner = scene.addAsleep("inner", box);
    fix(box, width, 40);
    tie(box, leading, scene.root, leading);
    tie(inner, width, box, width, 2);
    const auto across = tie(inner, leading, scene.root, leading, 9);
    scene.engine.addItem(box);
    scene.engine.addItem(inner);
    EXPECT_EQ(scene.frame("inner"), (Rect{9, 0, 42, 0}));
    scene.engine.removeItem(inner);
    scene.engine.removeItem(box);
    scene.engine.solve();
    EXPECT_EQ(inner.layoutEngine(), nullptr);
    across->setConstant(11);
    scene.engine.addItem(box);
    scene.engine.addItem(inner);
    EXPECT_EQ(scene.frame("inner"), (Rect{11, 0, 42, 0}));
}

TEST(Engine, OutlivedByConstraintsAndOutlivingItems) {
    LayoutConstraint::Pointer orphan;
    {
        Scene scene;
        Item& box = scene.add("box");
        Item& other = scene.add("other");
        orphan = tie(box, width, other, width, 2);
        std::weak_ptr<LayoutConstraint> unheld = fix(other, width, 40);
        EXPECT_EQ(scene.frame("box").width, 42);
        scene.items.erase("other");
        EXPECT_FALSE(orphan->isActive());
        EXPECT_TRUE(unheld.expired());
        orphan->setActive(true);
        EXPECT_FALSE(orphan->isActive());
        EXPECT_EQ(scene.frame("box").width, 0);
        EXPECT_EQ(platform::description(*orphan), "box.width == (gone).width + 2");
    }
    orphan->setConstant(3);
    orphan->setActive(true);
    EXPECT_FALSE(orphan->isActive());
}

TEST(Engine, LeavesWhatChangesWhilePlacingToTheNextPass) {
    Scene scene;
    int asked = 0;
    scene.engine.setOnNeedsSolve([&] { ++asked; });
    Item& box = scene.add("box");
    Item& gone = scene.add("gone");
    fix(box, width, 10);
    const auto size = fix(gone, width, 10);
    box.whenPlaced = [&] {
        box.whenPlaced = nullptr;
        box.natural = {0, 33};
        scene.engine.itemChanged(box);
        scene.engine.solve();
        scene.items.erase("gone");
    };
    scene.engine.solve();
    EXPECT_EQ(asked, 1);
    EXPECT_TRUE(scene.engine.needsSolve());
    EXPECT_EQ(scene.frame("box"), (Rect{0, 0, 10, 33}));
}

} // namespace
