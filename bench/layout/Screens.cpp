#include "bench/layout/Screens.h"

#include <algorithm>
#include <bit>
#include <cmath>

namespace bench {

using enum platform::LayoutAttribute;
using platform::StackAlignment;
using platform::StackDistribution;

namespace {

constexpr double iconSize = 32;
constexpr double inset = 8;
constexpr double gap = 10;
constexpr double lineHeight = 20;
constexpr double rowInset = 6;

double nameWidth(std::size_t row) {
    return 60 + static_cast<double>(row * 37 % 50);
}

struct Row {
    Box& row;
    Box& icon;
    Box& name;
    Box& value;
    Box& hairline;
};

Row addRow(Screen& screen, Box& list, std::size_t index) {
    Box& box = screen.add(list);
    Row row{box, screen.add(box, {iconSize, iconSize}),
            screen.add(box, {nameWidth(index), lineHeight}), screen.add(box, {70, lineHeight}),
            screen.add(box)};
    row.name.hugging = 251;
    row.value.resistance = 250;
    screen.tie(row.icon, leading, row.row, leading, inset);
    screen.tie(row.icon, centerY, row.row, centerY);
    screen.tie(row.name, leading, row.icon, trailing, gap);
    screen.tie(row.name, top, row.row, top, rowInset);
    screen.tie(row.row, bottom, row.name, bottom, rowInset);
    screen.tie(row.value, leading, row.name, trailing, gap);
    screen.tie(row.row, trailing, row.value, trailing, inset);
    screen.tie(row.value, centerY, row.name, centerY);
    screen.tie(row.hairline, leading, row.name, leading);
    screen.tie(row.hairline, trailing, row.row, trailing);
    screen.tie(row.hairline, bottom, row.row, bottom);
    screen.fix(row.hairline, height, 1);
    return row;
}

template<class Shape>
std::unique_ptr<Screen> list(std::size_t views, Shape shape) {
    auto screen = std::make_unique<Screen>(Size{360, 640});
    Box* previous = nullptr;
    for (std::size_t i = 0; i < views / 5; ++i) {
        const Row row = addRow(*screen, *screen->root, i);
        shape(row, i);
        screen->tie(row.row, leading, *screen->root, leading);
        screen->tie(row.row, trailing, *screen->root, trailing);
        screen->tie(row.row, top, previous ? *previous : *screen->root, previous ? bottom : top);
        previous = &row.row;
        if (i == views / 10) {
            screen->fix(row.name, width, 80);
            screen->changing = screen->fixed;
            screen->changingContent = &row.value;
        }
    }
    return screen;
}

} // namespace

double Box::layoutHeightForWidth(double width) const {
    return wraps > 0 && width > 0 ? lineHeight * std::ceil(wraps / width) : -1;
}

Box& Screen::add(Box& parent, Size natural) {
    boxes.push_back(std::make_unique<Box>(&parent));
    boxes.back()->natural = natural;
    return *boxes.back();
}

void Screen::tie(Box& first, platform::LayoutAttribute a, Box& second, platform::LayoutAttribute b,
                 double constant) {
    LayoutConstraint::Impl::equal(first, a, second, b, constant)->setActive(true);
}

void Screen::fix(Box& box, platform::LayoutAttribute a, double constant) {
    fixed = LayoutConstraint::Impl::make(box, a, platform::LayoutRelation::equal, nullptr, none, 1,
                                         constant);
    fixed->setActive(true);
}

void Screen::fill(Box& box, Box& parent, double by) {
    tie(box, leading, parent, leading, by);
    tie(box, top, parent, top, by);
    tie(parent, trailing, box, trailing, by);
    tie(parent, bottom, box, bottom, by);
}

void Screen::stack(Box& box, const std::vector<Box*>& arranged, const platform::StackRules& rules) {
    const std::vector<platform::LayoutItem*> items(arranged.begin(), arranged.end());
    stacks.push_back(std::make_unique<platform::StackConstraints>());
    stacks.back()->arrange(box, items, rules);
}

void Screen::addTo(platform::LayoutEngine& engine) {
    engine.setRootSize(size);
    engine.addItem(*root);
    for (const auto& box : boxes)
        engine.addItem(*box);
}

std::unique_ptr<Screen> listOfRows(std::size_t views) {
    return list(views, [](const Row&, std::size_t) {});
}

std::unique_ptr<Screen> listOfLongNames(std::size_t views) {
    return list(views, [](const Row& row, std::size_t i) {
        row.name.natural.width = 250 + static_cast<double>(i % 40) * 4;
    });
}

std::unique_ptr<Screen> listOfTexts(std::size_t views) {
    return list(views, [](const Row& row, std::size_t i) {
        row.name.resistance = 249;
        row.value.resistance = 250;
        row.name.natural.width = 400;
        row.name.wraps = 300 + static_cast<double>(i % 17) * 50;
    });
}

std::unique_ptr<Screen> oneStack(std::size_t views) {
    auto screen = std::make_unique<Screen>(Size{360, 20000});
    Box& column = screen->add(*screen->root);
    screen->fill(column, *screen->root, 0);
    std::vector<Box*> labels;
    for (std::size_t i = 0; i + 1 < views; ++i)
        labels.push_back(&screen->add(column, {nameWidth(i), lineHeight}));
    screen->stack(column, labels,
                  {Axis::vertical, StackDistribution::fill, StackAlignment::leading, 4});
    screen->fix(*labels[views / 2], height, 30);
    screen->changing = screen->fixed;
    screen->changingContent = labels[views / 3];
    return screen;
}

std::unique_ptr<Screen> overfullStack(std::size_t views) {
    auto screen = oneStack(views);
    screen->size.height = static_cast<double>(views) * 12;
    return screen;
}

std::unique_ptr<Screen> equalShares(std::size_t views) {
    auto screen = std::make_unique<Screen>(Size{20000, 100});
    Box& row = screen->add(*screen->root);
    screen->fill(row, *screen->root, 0);
    std::vector<Box*> labels;
    for (std::size_t i = 0; i + 1 < views; ++i)
        labels.push_back(&screen->add(row, {nameWidth(i), lineHeight}));
    screen->stack(row, labels,
                  {Axis::horizontal, StackDistribution::fillEqually, StackAlignment::center, 4});
    screen->fix(*labels[views / 2], height, 30);
    screen->changing = screen->fixed;
    screen->changingContent = labels[views / 3];
    return screen;
}

std::unique_ptr<Screen> stacksInStacks(std::size_t views) {
    // Room grows with the content: halves of halves in both directions.
    const double side = std::sqrt(static_cast<double>(views));
    auto screen = std::make_unique<Screen>(Size{110 * side, 22 * side});
    Box& outermost = screen->add(*screen->root);
    screen->fill(outermost, *screen->root, 10);
    for (std::size_t i = 0; screen->boxes.size() + 2 <= views; ++i) {
        Box& parent = *screen->boxes[i];
        parent.natural = {-1, -1};
        Box& first = screen->add(parent, {nameWidth(i), lineHeight});
        Box& second = screen->add(parent, {nameWidth(i + 1), lineHeight});
        screen->stack(parent, {&first, &second},
                      {std::bit_width(i + 1) % 2 ? Axis::horizontal : Axis::vertical,
                       StackDistribution::fill, StackAlignment::fill, 2});
    }
    screen->fix(*screen->boxes.back(), height, 24);
    screen->changing = screen->fixed;
    screen->changingContent = screen->boxes[screen->boxes.size() - 2].get();
    return screen;
}

std::vector<Rect> listOfRowsByHand(std::size_t views, Size size) {
    std::vector<Rect> frames;
    frames.reserve(views);
    double y = 0;
    for (std::size_t i = 0; i < views / 5; ++i) {
        const double name = i == views / 10 ? 80 : nameWidth(i);
        const double height = lineHeight + 2 * rowInset;
        const double nameX = inset + iconSize + gap;
        const double valueX = nameX + name + gap;
        frames.push_back({0, std::round(y), size.width, height});
        frames.push_back({inset, std::round((height - iconSize) / 2), iconSize, iconSize});
        frames.push_back({nameX, rowInset, name, lineHeight});
        frames.push_back(
            {valueX, rowInset, std::max(0.0, size.width - inset - valueX), lineHeight});
        frames.push_back({nameX, height - 1, size.width - nameX, 1});
        y += height;
    }
    return frames;
}

} // namespace bench
