#pragma once

#include "platform/ui/layout/ConstraintImpl.h"
#include "platform/ui/layout/LayoutEngine.h"
#include "platform/ui/layout/StackConstraints.h"

#include <memory>
#include <vector>

namespace bench {

using platform::Axis;
using platform::LayoutConstraint;
using platform::Rect;
using platform::Size;

/// A view without widgets, as cheap as it can be: what is measured is the layout.
struct Box : platform::LayoutItem {
    explicit Box(Box* boxParent) : parent(boxParent) {}
    platform::LayoutItem* layoutParent() const override { return parent; }
    bool isLaidOutByConstraints() const override { return true; }
    Rect handFrame() const override { return {}; }
    Size layoutIntrinsicSize() const override { return natural; }
    double layoutHeightForWidth(double width) const override;
    platform::LayoutPriority layoutHugging(Axis) const override { return hugging; }
    platform::LayoutPriority layoutCompressionResistance(Axis) const override { return resistance; }
    void setSolvedFrame(Rect solved) override { frame = solved; }
    std::string layoutName() const override { return "box"; }

    Box* parent;
    Size natural{-1, -1};
    /// The length of a text of lines of 10 points, that wraps; 0 for none.
    double wraps = 0;
    float hugging = 250;
    float resistance = 750;
    Rect frame;
};

/// A window's worth of boxes with their constraints, made and ready to be added to an engine.
struct Screen {
    explicit Screen(Size windowSize) : size(windowSize), root(std::make_unique<Box>(nullptr)) {}
    Box& add(Box& parent, Size natural = {-1, -1});
    void tie(Box& first, platform::LayoutAttribute a, Box& second, platform::LayoutAttribute b,
             double constant = 0);
    void fix(Box& box, platform::LayoutAttribute a, double constant);
    void fill(Box& box, Box& parent, double inset);
    void stack(Box& box, const std::vector<Box*>& arranged, const platform::StackRules& rules);
    void addTo(platform::LayoutEngine& engine);

    Size size;
    std::unique_ptr<Box> root;
    std::vector<std::unique_ptr<Box>> boxes;
    std::vector<std::unique_ptr<platform::StackConstraints>> stacks;
    /// What a change of one constant changes, and a change of one content.
    LayoutConstraint::Pointer changing;
    LayoutConstraint::Pointer fixed;
    Box* changingContent = nullptr;
};

/// A list of rows of five views: row, icon, name, value, hairline.
std::unique_ptr<Screen> listOfRows(std::size_t views);
/// The same with names too long for the window: every row gives something up.
std::unique_ptr<Screen> listOfLongNames(std::size_t views);
/// The same with texts that wrap.
std::unique_ptr<Screen> listOfTexts(std::size_t views);
/// One stack of all views.
std::unique_ptr<Screen> oneStack(std::size_t views);
/// The same with room for half of them.
std::unique_ptr<Screen> overfullStack(std::size_t views);
/// One stack that gives all views the same size.
std::unique_ptr<Screen> equalShares(std::size_t views);
/// Stacks of two in stacks of two.
std::unique_ptr<Screen> stacksInStacks(std::size_t views);

/// What a programmer without an engine writes for listOfRows: the same frames by plain arithmetic.
std::vector<Rect> listOfRowsByHand(std::size_t views, Size size);

} // namespace bench
