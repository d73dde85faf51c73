#pragma once

#include <QPointF>
#include <QRectF>
#include <QSizeF>

namespace platform {

/// How something is looked at through a view that it may be larger than: which part of it, and how
/// large. Keeps it fitted until somebody zooms. The content's measures are points at a zoom of 1.
class ZoomPlace {
public:
    enum class Fit {
        /// All of it is in view, and nothing is drawn larger than it is.
        whole,
        /// As wide as the view.
        width,
        /// As large as it is, from the corner where reading begins.
        none
    };
    struct Limits {
        Fit fit = Fit::whole;
        /// Around the content, in points of the view.
        double margin = 0;
        /// Pixels of the content that one zooms in to at most, for each point of the view.
        double largestZoom = 8;
        /// One zooms out to this, or until it fits where that is smaller.
        double smallestZoom = 1;
        /// Reading begins at the right: what is not fitted stays there when sizes change.
        bool fromRight = false;
    };

    explicit ZoomPlace(const Limits& limits) : limits_(limits) {}

    double zoom() const { return zoom_; }
    /// Of the content, in the view.
    QPointF origin() const { return origin_; }
    double fittingZoom() const;
    QPointF toContent(QPointF point) const { return (point - origin_) / zoom_; }
    /// The part of the content that is in view.
    QRectF visibleRect() const;

    /// For a scroll bar: in points of the view, margins included.
    struct Extent {
        double offset;
        double view;
        double length;
    };
    Extent extent(Qt::Orientation direction) const;

    /// The same share of the content stays in view.
    void setSizes(QSizeF view, QSizeF content);
    /// What is at `point` of the view stays there.
    void zoomTo(double zoom, QPointF point);
    /// That place of the content comes to `point`, as far as the edges let it. No longer fitted.
    void bring(QPointF content, double zoom, QPointF point);
    /// Answers whether all of the way was free.
    bool moveBy(QPointF distance);
    void scrollTo(Qt::Orientation direction, double offset);

private:
    double clampedZoom(double zoom) const;
    void settle();

    const Limits limits_;
    QSizeF view_;
    QSizeF content_;
    double zoom_ = 1;
    QPointF origin_;
    bool fitted_ = true;
};

} // namespace platform
