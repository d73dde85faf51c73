#pragma once

#include "platform/ui/LayoutConstraint.h"

#include <memory>
#include <string>

namespace platform {

class LayoutEngine;
struct LayoutLink;

/// What the layout engine knows of a view: its place in the tree, its natural size and where to put
/// the answer. Implemented by View; a test implements it without widgets. Main thread.
///
/// An item that dies leaves its engine and deactivates the constraints that mention it, so neither
/// an engine nor a constraint can meet a dead item.
class LayoutItem {
public:
    LayoutItem();
    virtual ~LayoutItem();
    LayoutItem(const LayoutItem&) = delete;
    LayoutItem& operator=(const LayoutItem&) = delete;

    /// None for the root of the tree. The same in and out of a window.
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
    /// The solved frame, in the parent's coordinates, rounded to whole pixels. Not called for a
    /// root nor for an item whose frame is set by hand: their frames are given, not solved.
    virtual void setSolvedFrame(Rect frame) = 0;
    virtual std::string layoutName() const = 0;
    /// The view that the item stands for; none for an item without one.
    virtual View* layoutView() { return nullptr; }

    /// The engine that the item was added to; none outside any.
    LayoutEngine* layoutEngine() const;

    /// What constraints and the engine hold of the item; outlives it.
    const std::shared_ptr<LayoutLink>& layoutLink() const { return link_; }

private:
    std::shared_ptr<LayoutLink> link_;
};

} // namespace platform
