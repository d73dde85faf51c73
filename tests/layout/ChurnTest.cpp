#include "tests/layout/Scene.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <random>

using namespace test;
using enum platform::LayoutAttribute;
using platform::LayoutEngine;

namespace {

/// A tree of items that changes at random. Every wish has a priority of its own, so that there is
/// one best answer.
class Garden {
public:
    explicit Garden(unsigned seed) : dice_(seed) { startAfresh(); }

    void change() {
        switch (roll(0, 9)) {
        case 0:
        case 1:
            plant();
            break;
        case 2:
            uproot();
            break;
        case 3:
        case 4:
        case 5:
            tieAtRandom();
            break;
        case 6:
            if (auto* const constraint = anyConstraint())
                (*constraint)->setActive(!(*constraint)->isActive());
            break;
        case 7:
            if (auto* const constraint = anyConstraint())
                (*constraint)->setConstant(roll(-10, 40));
            break;
        case 8:
            if (!items_.empty()) {
                Item& item = *items_[any(items_)];
                item.natural.width = roll(-1, 60);
                item.byHand = roll(0, 5) == 0;
                item.given = {double(roll(0, 50)), 3, double(roll(0, 90)), 10};
                engine_->itemChanged(item);
            }
            break;
        default:
            size_ = {double(roll(50, 400)), double(roll(50, 400))};
            isRightToLeft_ = roll(0, 1) == 1;
            configure();
        }
    }
    std::vector<Rect> frames() {
        for (int pass = 0; engine_->needsSolve() && pass < 3; ++pass)
            engine_->solve();
        std::vector<Rect> frames;
        for (const auto& item : items_)
            frames.push_back(item->byHand ? Rect{} : item->frame);
        return frames;
    }
    /// The same items and constraints in an engine that knows nothing yet.
    void startAfresh() {
        auto fresh = std::make_unique<LayoutEngine>();
        fresh->addItem(root_);
        for (const auto& item : items_)
            fresh->addItem(*item);
        engine_ = std::move(fresh);
        configure();
    }

private:
    int roll(int from, int to) { return std::uniform_int_distribution<int>(from, to)(dice_); }
    template<class List>
    std::size_t any(const List& list) {
        return static_cast<std::size_t>(roll(0, static_cast<int>(list.size()) - 1));
    }
    float ownPriority() {
        // Scattered over the whole range, none twice.
        return 1 + static_cast<float>(priorities_++ * 7919 % 19980) * 0.05F;
    }
    LayoutConstraint::Pointer* anyConstraint() {
        return constraints_.empty() ? nullptr : &constraints_[any(constraints_)];
    }
    void configure() {
        engine_->setRootSize(size_);
        engine_->setRightToLeft(isRightToLeft_);
    }
    void wish(LayoutConstraint::Pointer constraint) {
        constraint->setPriority(ownPriority());
        constraint->setActive(true);
    }
    void plant() {
        Item* const parent = items_.empty() || roll(0, 2) == 0 ? &root_ : items_[any(items_)].get();
        items_.push_back(std::make_unique<Item>("item", parent));
        Item& item = *items_.back();
        item.natural = {double(roll(0, 50)), -1};
        item.hugX = ownPriority();
        item.resistX = ownPriority();
        for (const auto edge : {leading, top})
            wish(LayoutConstraint::Impl::equal(item, edge, *parent, edge, roll(-5, 20)));
        for (const auto size : {width, height})
            wish(LayoutConstraint::Impl::make(item, size, LayoutRelation::equal, nullptr, none, 1,
                                              roll(0, 60)));
        engine_->addItem(item);
    }
    void uproot() {
        const auto leaf = std::find_if(items_.begin(), items_.end(), [this](const auto& item) {
            return std::none_of(items_.begin(), items_.end(),
                                [&](const auto& other) { return other->parent == item.get(); });
        });
        if (leaf == items_.end())
            return;
        if (roll(0, 1) == 1) {
            items_.erase(leaf);
            std::erase_if(constraints_, [](const auto& c) { return !c->isActive(); });
            return;
        }
        engine_->removeItem(**leaf);
        engine_->solve();
        engine_->addItem(**leaf);
        std::rotate(leaf, leaf + 1, items_.end());
    }
    void tieAtRandom() {
        if (items_.empty())
            return;
        static constexpr std::array across = {leading, trailing, centerX, width, left, right};
        static constexpr std::array down = {top, bottom, centerY, height};
        const bool isAcross = roll(0, 1) == 1;
        const auto attribute = [&] { return isAcross ? across[any(across)] : down[any(down)]; };
        Item& first = *items_[any(items_)];
        Item* const second = roll(0, 3) == 0 ? &root_ : items_[any(items_)].get();
        auto constraint = LayoutConstraint::Impl::make(
            first, attribute(), static_cast<LayoutRelation>(roll(-1, 1)), second, attribute(),
            roll(0, 4) == 0 ? 0.5 : 1, roll(-10, 40));
        if (roll(0, 2) > 0)
            constraint->setPriority(ownPriority());
        constraint->setActive(true);
        constraints_.push_back(constraint);
    }

    std::mt19937 dice_;
    int priorities_ = 0;
    Item root_{"root", nullptr};
    std::unique_ptr<LayoutEngine> engine_;
    std::vector<std::unique_ptr<Item>> items_;
    std::vector<LayoutConstraint::Pointer> constraints_;
    Size size_{300, 200};
    bool isRightToLeft_ = false;
};

TEST(Churn, LaysOutAsAFreshEngineDoes) {
    platform::setLogSink({[](int) { return false; }, {}});
    for (unsigned round = 0; round < 150; ++round) {
        Garden garden(round);
        for (int step = 0; step < 12; ++step) {
            for (int change = 0; change < 5; ++change) {
                garden.change();
                if (change % 2)
                    garden.frames();
            }
            const auto frames = garden.frames();
            garden.startAfresh();
            ASSERT_EQ(frames, garden.frames()) << "round " << round << ", step " << step;
        }
    }
    platform::setLogSink({});
}

} // namespace
