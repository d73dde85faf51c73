#pragma once

#include "platform/base/Log.h"
#include "platform/ui/layout/ConstraintImpl.h"
#include "platform/ui/layout/LayoutEngine.h"

#include <cmath>
#include <functional>
#include <map>
#include <memory>
#include <ostream>
#include <string>
#include <vector>

namespace platform {
inline std::ostream& operator<<(std::ostream& out, const Rect& r) {
    return out << r.x << ", " << r.y << ", " << r.width << ", " << r.height;
}
} // namespace platform

namespace test {

using platform::Axis;
using platform::LayoutAttribute;
using platform::LayoutConstraint;
using platform::LayoutRelation;
using platform::Rect;
using platform::Size;

/// A view without widgets. Laid out by constraints unless it has a frame.
struct Item : platform::LayoutItem {
    Item(std::string itemName, Item* itemParent) : name(std::move(itemName)), parent(itemParent) {}

    platform::LayoutItem* layoutParent() const override { return parent; }
    bool isLaidOutByConstraints() const override { return !byHand; }
    Rect handFrame() const override { return given; }
    Size layoutIntrinsicSize() const override { return natural; }
    double layoutHeightForWidth(double width) const override {
        return heightForWidth ? heightForWidth(width) : -1;
    }
    platform::LayoutPriority layoutHugging(Axis axis) const override {
        return axis == Axis::horizontal ? hugX : hugY;
    }
    platform::LayoutPriority layoutCompressionResistance(Axis axis) const override {
        return axis == Axis::horizontal ? resistX : resistY;
    }
    void setSolvedFrame(Rect solved) override {
        frame = solved;
        ++timesPlaced;
        if (whenPlaced)
            whenPlaced();
    }
    std::string layoutName() const override { return name; }

    std::string name;
    Item* parent;
    bool byHand = false;
    Rect given;
    Size natural{-1, -1};
    std::function<double(double width)> heightForWidth;
    float hugX = 250, hugY = 250, resistX = 750, resistY = 750;
    Rect frame;
    int timesPlaced = 0;
    std::function<void()> whenPlaced;
};

/// A window's tree of items with its engine, and the warnings it logs.
class Scene {
public:
    explicit Scene(Size size = {300, 200}) {
        platform::setLogSink({[](int) { return true; },
                              [this](int, std::string message, const std::source_location&) {
                                  log.push_back(std::move(message));
                              }});
        engine.setRootSize(size);
        engine.addItem(root);
    }
    ~Scene() { platform::setLogSink({}); }
    Scene(const Scene&) = delete;
    Scene& operator=(const Scene&) = delete;

    Item& add(const std::string& name, Item& parent) {
        Item& item = addAsleep(name, parent);
        engine.addItem(item);
        return item;
    }
    Item& add(const std::string& name) { return add(name, root); }
    /// In the tree, but not in the window.
    Item& addAsleep(const std::string& name, Item& parent) {
        return *(items[name] = std::make_unique<Item>(name, &parent));
    }
    Item& label(const std::string& name, Size natural) { return label(name, natural, root); }
    Item& label(const std::string& name, Size natural, Item& parent) {
        Item& item = addAsleep(name, parent);
        item.natural = natural;
        engine.addItem(item);
        return item;
    }
    /// A text of one line of 10 points, `length` points long, that wraps.
    Item& text(const std::string& name, double length) {
        Item& item = addAsleep(name, root);
        item.natural = {length, 10};
        item.heightForWidth = [length](double width) {
            return width > 0 ? 10 * std::ceil(length / width) : 10;
        };
        engine.addItem(item);
        return item;
    }
    Item& operator[](const std::string& name) { return *items.at(name); }
    Rect frame(const std::string& name) {
        engine.solve();
        return (*this)[name].frame;
    }

    std::vector<std::string> log;
    platform::LayoutEngine engine;
    Item root{"root", nullptr};
    std::map<std::string, std::unique_ptr<Item>> items;
};

inline LayoutConstraint::Pointer active(LayoutConstraint::Pointer constraint) {
    constraint->setActive(true);
    return constraint;
}

/// first.a == second.b + constant, active.
inline LayoutConstraint::Pointer tie(Item& first, LayoutAttribute a, Item& second,
                                     LayoutAttribute b, double constant = 0) {
    return active(LayoutConstraint::Impl::equal(first, a, second, b, constant));
}

inline LayoutConstraint::Pointer relate(Item& first, LayoutAttribute a, LayoutRelation relation,
                                        Item& second, LayoutAttribute b, double constant = 0,
                                        double multiplier = 1) {
    return active(
        LayoutConstraint::Impl::make(first, a, relation, &second, b, multiplier, constant));
}

/// item.a (relation) constant, active.
inline LayoutConstraint::Pointer fix(Item& item, LayoutAttribute a, double constant,
                                     float priority = 1000,
                                     LayoutRelation relation = LayoutRelation::equal) {
    auto constraint = LayoutConstraint::Impl::make(item, a, relation, nullptr,
                                                   LayoutAttribute::none, 1, constant);
    constraint->setPriority(priority);
    return active(constraint);
}

} // namespace test
