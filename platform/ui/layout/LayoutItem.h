#pragma once

#include "platform/ui/LayoutConstraint.h"

#include <string>

namespace platform {

/// What the layout engine knows of a view: its place in the tree, its natural size and where to put
/// the answer. Implemented by View; a test implements it without widgets.
class LayoutItem {
public:
    virtual ~LayoutItem() = default;

    /// None for the root of the tree.
    virtual LayoutItem* layoutParent() const = 0;
    virtual bool isLaidOutByConstraints() const = 0;
    /// The frame set by hand, in the parent's coordinates: what holds for an item that is not laid
    /// out by constraints.
    virtual Rect handFrame() const = 0;
    virtual Size layoutIntrinsicSize() const = 0;
    /// noIntrinsicMetric when the height does not depend on the width.
    virtual double layoutHeightForWidth(double width) const = 0;
    virtual LayoutPriority layoutHugging(Axis axis) const = 0;
    virtual LayoutPriority layoutCompressionResistance(Axis axis) const = 0;
    /// The solved frame, in the parent's coordinates, rounded to whole pixels.
    virtual void setSolvedFrame(Rect frame) = 0;
    virtual std::string layoutName() const = 0;
};

} // namespace platform
