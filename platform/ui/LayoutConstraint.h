#pragma once

#include "platform/ui/Geometry.h"

#include <memory>
#include <string>
#include <vector>

namespace platform {

class View;

enum class LayoutAttribute {
    none,
    left,
    right,
    top,
    bottom,
    leading,
    trailing,
    width,
    height,
    centerX,
    centerY
};

enum class LayoutRelation { lessOrEqual = -1, equal = 0, greaterOrEqual = 1 };

/// Priorities from 1 to 1000; only 1000 is required. Named ones are the toolkit's defaults.
using LayoutPriority = float;
inline constexpr LayoutPriority layoutRequired = 1000;
inline constexpr LayoutPriority layoutHigh = 750;
inline constexpr LayoutPriority layoutLow = 250;

/// first.attribute (relation) second.attribute * multiplier + constant, in the coordinates of the
/// nearest view that holds both. Works while it is active and both views live in one window's tree;
/// sleeps otherwise. Main thread.
///
/// The views are not owned: one that dies deactivates its constraints. An active constraint is kept
/// alive by its views.
///
/// With leading or trailing on either side the constant counts in reading direction, otherwise from
/// left to right.
///
/// Requirements that contradict each other never fail: the weakest, and among equals the one
/// activated last, gives way, and one log line names it.
class LayoutConstraint : public std::enable_shared_from_this<LayoutConstraint> {
public:
    using Pointer = std::shared_ptr<LayoutConstraint>;

    /// `second` may be none for a constant size (then its attribute is LayoutAttribute::none).
    static Pointer make(View& first, LayoutAttribute attribute, LayoutRelation relation,
                        View* second, LayoutAttribute secondAttribute, double multiplier = 1,
                        double constant = 0);
    /// first.attribute == second.attribute + constant
    static Pointer equal(View& first, LayoutAttribute attribute, View& second,
                         LayoutAttribute secondAttribute, double constant = 0);
    static Pointer constant(View& first, LayoutAttribute attribute, LayoutRelation relation,
                            double constant);
    ~LayoutConstraint();
    LayoutConstraint(const LayoutConstraint&) = delete;
    LayoutConstraint& operator=(const LayoutConstraint&) = delete;

    static void activate(const std::vector<Pointer>& constraints);
    static void deactivate(const std::vector<Pointer>& constraints);

    bool isActive() const;
    void setActive(bool active);
    double constant() const;
    void setConstant(double constant);
    LayoutPriority priority() const;
    /// From 1 to 1000; values outside become the nearest. May change at any time.
    void setPriority(LayoutPriority priority);

    View* firstView() const;
    LayoutAttribute firstAttribute() const;
    LayoutRelation relation() const;
    View* secondView() const;
    LayoutAttribute secondAttribute() const;
    double multiplier() const;

    struct Impl;
    Impl& impl() const { return *impl_; }

private:
    explicit LayoutConstraint(std::unique_ptr<Impl> impl);
    std::unique_ptr<Impl> impl_;
};

/// "View(name).trailing == View(name).trailing - 8", for logs.
void appendDescription(std::string& out, const LayoutConstraint& constraint);

} // namespace platform
