#pragma once

#include "platform/ui/StackView.h"
#include "platform/ui/layout/LayoutItem.h"

#include <compare>
#include <map>
#include <span>

namespace platform {

struct StackRules {
    Axis axis = Axis::horizontal;
    StackDistribution distribution = StackDistribution::fill;
    StackAlignment alignment = StackAlignment::fill;
    double spacing = 0;
};

/// How firmly a stack aligns its items across the axis, and keeps them inside its edges there: what
/// is required of an item wins, such as an inset, or a line that crosses the whole screen.
inline constexpr LayoutPriority stackAlignment = 999.5F;

/// The constraints that line items up, made and kept in step with what is shown and how. A
/// constraint that still holds after a change stays as it is.
class StackConstraints {
public:
    StackConstraints() = default;
    ~StackConstraints();
    StackConstraints(const StackConstraints&) = delete;
    StackConstraints& operator=(const StackConstraints&) = delete;

    /// `shown` without what is hidden; all of it inside `stack`.
    void arrange(LayoutItem& stack, std::span<LayoutItem* const> shown, const StackRules& rules);

private:
    /// What makes a constraint the same one: all but its constant.
    struct Line {
        LayoutItem* first;
        LayoutAttribute attribute;
        LayoutRelation relation;
        LayoutItem* second;
        LayoutAttribute secondAttribute;
        auto operator<=>(const Line&) const = default;
    };
    struct Wanted {
        Line line;
        double constant;
        LayoutPriority priority = layoutRequired;
    };
    using Lines = std::map<Line, LayoutConstraint::Pointer>;

    static std::vector<Wanted> along(LayoutItem& stack, std::span<LayoutItem* const> shown,
                                     const StackRules& rules);
    static std::vector<Wanted> across(LayoutItem& stack, std::span<LayoutItem* const> shown,
                                      const StackRules& rules);

    Lines lines_;
};

} // namespace platform
