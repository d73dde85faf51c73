#pragma once

#include "platform/ui/layout/LayoutLink.h"
#include "platform/ui/layout/Solver.h"

#include <cstdint>

namespace platform {

/// A constraint's own state, over layout items; the View interface of LayoutConstraint wraps it.
struct LayoutConstraint::Impl {
    struct End {
        std::shared_ptr<LayoutLink> link;
        LayoutAttribute attribute = LayoutAttribute::none;
        LayoutItem* item() const { return link ? link->item : nullptr; }
    };

    /// `second` may be none for a constant size.
    static Pointer make(LayoutItem& first, LayoutAttribute attribute, LayoutRelation relation,
                        LayoutItem* second, LayoutAttribute secondAttribute, double multiplier = 1,
                        double constant = 0);
    /// first.attribute == second.attribute + constant
    static Pointer equal(LayoutItem& first, LayoutAttribute attribute, LayoutItem& second,
                         LayoutAttribute secondAttribute, double constant = 0);

    void setActive(LayoutConstraint& self, bool value);
    /// The engine in which both ends stand; none while the constraint sleeps.
    LayoutEngine* engine() const;
    bool hasSecond() const { return second.link && second.attribute != LayoutAttribute::none; }
    /// How strongly the relation resists on either side.
    layout::Strength strength() const;

    End first;
    End second;
    LayoutRelation relation = LayoutRelation::equal;
    double multiplier = 1;
    double constant = 0;
    LayoutPriority priority = layoutRequired;
    bool active = false;
    /// Grows with every activation: of two equals, the later one gives way.
    std::uint64_t activation = 0;

    /// The engine's: the row of its solver, and whether it waits for the next solve.
    layout::Row row = -1;
    bool pending = false;
};

} // namespace platform
