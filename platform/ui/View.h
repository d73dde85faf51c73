#pragma once

#include "platform/ui/Color.h"
#include "platform/ui/Geometry.h"
#include "platform/ui/LayoutConstraint.h"

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace platform {

class Canvas;
class ShapeLayer;
class Window;
struct LayerShadow;

/// The value of an intrinsic width or height that a view does not have.
inline constexpr double noIntrinsicMetric = -1;

/// A rectangle on screen that can hold others: the base of every control. Made with
/// std::make_shared; a parent owns its children, a child knows its parent. Main thread only.
///
/// A view's frame is set by hand (setFrame) until it is laid out by constraints; then the window's
/// solver sets it, once a turn of the event loop or at layoutIfNeeded().
class View : public std::enable_shared_from_this<View> {
public:
    explicit View(Rect frame = {});
    virtual ~View();
    View(const View&) = delete;
    View& operator=(const View&) = delete;

    void addSubview(const std::shared_ptr<View>& child);
    void insertSubview(const std::shared_ptr<View>& child, std::size_t index);
    void removeFromSuperview();
    View* superview() const;
    const std::vector<std::shared_ptr<View>>& subviews() const;
    /// The window in whose tree the view stands; none outside any.
    Window* window() const;

    /// In the parent's coordinates.
    Rect frame() const;
    void setFrame(Rect frame);
    Rect bounds() const;
    /// A rectangle of this view's coordinates in the window's; unchanged outside any window.
    Rect convertToWindow(Rect rect) const;

    bool isHidden() const;
    void setHidden(bool hidden);
    double alpha() const;
    void setAlpha(double alpha);
    std::optional<Color> backgroundColor() const;
    void setBackgroundColor(std::optional<Color> color);
    void setCornerRadius(double radius);
    bool isUserInteractionEnabled() const;
    void setUserInteractionEnabled(bool enabled);
    /// What a screen reader says; controls with a title default to it.
    void setAccessibleName(std::string_view name);
    /// A name for logs and tests.
    void setDebugName(std::string_view name);
    std::string debugName() const;

    /// Whether constraints alone say where this view goes (else its frame becomes constraints).
    bool isLaidOutByConstraints() const;
    void setLaidOutByConstraints(bool value);
    LayoutPriority contentHuggingPriority(Axis axis) const;
    void setContentHuggingPriority(LayoutPriority priority, Axis axis);
    LayoutPriority compressionResistancePriority(Axis axis) const;
    void setCompressionResistancePriority(LayoutPriority priority, Axis axis);
    /// The natural size of the content, noIntrinsicMetric where there is none.
    virtual Size intrinsicContentSize() const;
    /// The natural height at a given width, for content that wraps; noIntrinsicMetric otherwise.
    virtual double intrinsicHeightForWidth(double width) const;
    void invalidateIntrinsicContentSize();
    void setNeedsLayout();
    void layoutIfNeeded();
    /// Resizes to the intrinsic size.
    void sizeToFit();
    /// Calls the handler for every tap (or click) inside the view; makes it focusable, so that
    /// Space and Enter tap it as well.
    void addTapHandler(std::function<void()> handler);
    /// Shapes drawn over the background, below the subviews, in the order of their addition.
    void addLayer(const std::shared_ptr<ShapeLayer>& layer);
    /// A shadow below those shapes.
    void setLayerShadow(const LayerShadow& shadow);
    /// Repaints at the end of this turn of the event loop.
    void setNeedsDisplay();

    struct Impl;
    Impl& impl() const { return *impl_; }

protected:
    explicit View(std::unique_ptr<Impl> impl);
    /// Called after the solver has set this view's frame and those of its children.
    virtual void layoutSubviews();
    virtual void didMoveToWindow();
    /// A subview was hidden or shown, or its natural size changed.
    virtual void subviewDidChange(View& child);
    /// Paints the view's own content over its background and layers.
    virtual void draw(Canvas& canvas);

private:
    friend struct Impl;
    std::unique_ptr<Impl> impl_;
};

} // namespace platform
