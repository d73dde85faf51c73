#pragma once

#include "platform/ui/ShapeLayer.h"
#include "platform/ui/View.h"
#include "platform/ui/layout/LayoutItem.h"

#include <QAccessible>
#include <QPointer>
#include <QWidget>

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

class QPainter;

namespace platform {

class ViewController;

/// A view's widget, its place in the tree and in the layout. Controls derive from it.
struct View::Impl : public LayoutItem {
    /// None: a plain widget that paints the background and what the view draws.
    explicit Impl(std::unique_ptr<QWidget> ownWidget = nullptr);
    ~Impl() override;
    Impl(const Impl&) = delete;
    Impl& operator=(const Impl&) = delete;

    /// Where the control paints itself; `bounds` is the view's exact rectangle in the painter.
    virtual void paintContent(QPainter& painter, const QRectF& bounds);
    /// The text scale, the reading direction or the theme's fonts changed.
    virtual void settingsChanged();
    /// The screen reader's kind of thing.
    virtual QAccessible::Role accessibleRole() const;
    virtual QString accessibleText() const;

    void paint(QPainter& painter);
    void paintBackground(QPainter& painter, const QRectF& bounds) const;
    void paintLayers(QPainter& painter) const;
    void activateTap();
    void insert(const std::shared_ptr<View>& child, std::size_t index);
    void detachFromSuperview();
    void moveToWindow(Window* target);
    void settingsChangedInTree();
    void applyGeometry();
    void setFrameNow(Rect value);
    void setTranslation(Point value);
    void applyEffect();
    void setScale(double value);
    void markNeedsLayout();
    /// Tells the layout engine that something about this view changed.
    void itemChanged();
    /// Tells the view that one of its subviews changed, and lays it out again.
    void subviewChanged(View& child);
    void runLayoutSubviews();
    void updateAccessibleName();

    LayoutItem* layoutParent() const override;
    bool isLaidOutByConstraints() const override { return byConstraints; }
    Rect handFrame() const override { return hand; }
    Size layoutIntrinsicSize() const override;
    double layoutHeightForWidth(double width) const override;
    LayoutPriority layoutHugging(Axis axis) const override;
    LayoutPriority layoutCompressionResistance(Axis axis) const override;
    void setSolvedFrame(Rect solved) override;
    std::string layoutName() const override;
    View* layoutView() override { return self; }

    View* self = nullptr;
    QPointer<QWidget> widget;
    View* superview = nullptr;
    std::vector<std::shared_ptr<View>> subviews;
    Window* window = nullptr;
    /// The screen whose view this is.
    ViewController* controller = nullptr;

    Rect frame;
    Rect hand;
    /// Moves the widget without moving the frame: pages and sheets that slide.
    Point translation;
    /// The fraction of a pixel by which the frame starts after the widget does.
    Point contentOffset;
    double scale = 1;
    double alpha = 1;
    double cornerRadius = 0;
    bool hidden = false;
    bool byConstraints = false;
    bool needsLayout = false;
    /// This view or one below it needs layoutSubviews.
    bool treeNeedsLayout = false;
    std::optional<Color> background;
    std::string accessibleName;
    /// In place of the control's own.
    std::optional<QAccessible::Role> role;
    std::string debugName;
    std::vector<std::function<void()>> tapHandlers;
    std::vector<std::shared_ptr<ShapeLayer>> layers;
    LayerShadow shadow;
    LayoutPriority hugging[2] = {layoutLow, layoutLow};
    LayoutPriority resistance[2] = {layoutHigh, layoutHigh};
};

/// Drops the reference in a later turn of the event loop: what a user's press does may let go of
/// the very widget whose event is being handled.
void keepUntilNextTurn(std::shared_ptr<void> object);

/// The view whose own widget this is; none for a widget inside or outside any view.
View* ownerOf(const QWidget* widget);

/// Whether keyboard focus may rest on the widget (visible, enabled, a tab stop).
bool canTakeFocus(const QWidget& widget);

} // namespace platform
