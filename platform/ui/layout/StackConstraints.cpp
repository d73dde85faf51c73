#include "platform/ui/layout/StackConstraints.h"

#include "platform/ui/layout/ConstraintImpl.h"

#include <utility>

namespace platform {

namespace {

struct Attributes {
    LayoutAttribute start;
    LayoutAttribute end;
    LayoutAttribute center;
    LayoutAttribute size;
};

constexpr Attributes horizontalAttributes{LayoutAttribute::leading, LayoutAttribute::trailing,
                                          LayoutAttribute::centerX, LayoutAttribute::width};
constexpr Attributes verticalAttributes{LayoutAttribute::top, LayoutAttribute::bottom,
                                        LayoutAttribute::centerY, LayoutAttribute::height};

} // namespace

StackConstraints::~StackConstraints() {
    for (const auto& [line, constraint] : lines_)
        constraint->setActive(false);
}

std::vector<StackConstraints::Wanted> StackConstraints::along(LayoutItem& stack,
                                                              std::span<LayoutItem* const> shown,
                                                              const StackRules& rules) {
    const Attributes& on =
        rules.axis == Axis::horizontal ? horizontalAttributes : verticalAttributes;
    constexpr auto equal = LayoutRelation::equal;
    std::vector<Wanted> wanted;
    for (std::size_t i = 0; i < shown.size(); ++i) {
        if (i == 0)
            wanted.push_back({{shown[i], on.start, equal, &stack, on.start}, 0});
        else
            wanted.push_back({{shown[i], on.start, equal, shown[i - 1], on.end}, rules.spacing});
        if (i > 0 && rules.distribution == StackDistribution::fillEqually)
            wanted.push_back({{shown[i], on.size, equal, shown[i - 1], on.size}, 0});
    }
    if (!shown.empty())
        wanted.push_back({{shown.back(), on.end, equal, &stack, on.end}, 0});
    return wanted;
}

std::vector<StackConstraints::Wanted> StackConstraints::across(LayoutItem& stack,
                                                               std::span<LayoutItem* const> shown,
                                                               const StackRules& rules) {
    const Attributes& on =
        rules.axis == Axis::horizontal ? verticalAttributes : horizontalAttributes;
    constexpr auto equal = LayoutRelation::equal;
    std::vector<Wanted> wanted;
    for (LayoutItem* const item : shown) {
        const auto keep = [&](LayoutAttribute attribute,
                              LayoutRelation relation = LayoutRelation::equal,
                              LayoutPriority priority = stackAlignment) {
            wanted.push_back({{item, attribute, relation, &stack, attribute}, 0, priority});
        };
        switch (rules.alignment) {
        case StackAlignment::fill:
            keep(on.start, equal, layoutRequired);
            keep(on.end, equal, layoutRequired);
            break;
        case StackAlignment::leading:
            keep(on.start);
            keep(on.end, LayoutRelation::lessOrEqual);
            break;
        case StackAlignment::center:
            keep(on.center);
            keep(on.start, LayoutRelation::greaterOrEqual);
            break;
        case StackAlignment::trailing:
            keep(on.end);
            keep(on.start, LayoutRelation::greaterOrEqual);
            break;
        }
    }
    return wanted;
}

void StackConstraints::arrange(LayoutItem& stack, std::span<LayoutItem* const> shown,
                               const StackRules& rules) {
    std::vector<Wanted> wanted = along(stack, shown, rules);
    const std::vector<Wanted> rest = across(stack, shown, rules);
    wanted.insert(wanted.end(), rest.begin(), rest.end());
    Lines kept;
    std::vector<LayoutConstraint::Pointer> fresh;
    for (const auto& [line, constant, priority] : wanted) {
        auto found = lines_.extract(line);
        // One that is no longer active lost an item that stood at the same address.
        if (found && found.mapped()->isActive()) {
            found.mapped()->setConstant(constant);
            found.mapped()->setPriority(priority);
            kept.insert(std::move(found));
            continue;
        }
        const auto made =
            LayoutConstraint::Impl::make(*line.first, line.attribute, line.relation, line.second,
                                         line.secondAttribute, 1, constant);
        made->setPriority(priority);
        kept.emplace(line, made);
        fresh.push_back(made);
    }
    // The old ones first: together with the new they might contradict each other.
    for (const auto& [line, constraint] : lines_)
        constraint->setActive(false);
    lines_ = std::move(kept);
    LayoutConstraint::activate(fresh);
}

} // namespace platform
