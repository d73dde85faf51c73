#pragma once

#include "platform/documents/preview/Flinger.h"
#include "platform/documents/preview/ReadableText.h"
#include "platform/documents/preview/ZoomPlace.h"
#include "platform/ui/Color.h"

#include <QWidget>

#include <functional>
#include <memory>
#include <optional>

class QScrollBar;
class QTouchEvent;

namespace platform {

/// What can be looked at through a ZoomWidget. Its measures are points at a zoom of 1.
class ZoomContent {
public:
    virtual ~ZoomContent() = default;
    virtual QSizeF contentSize() const = 0;
    /// Paints the part `visible`; the painter draws in the content's measures.
    virtual void paintContent(QPainter& painter, const QRectF& visible, double zoom) = 0;
};

/// A view through which one sees a part of something larger: drags and flings, wheel, keys, pinch,
/// double tap. Keeps the content fitted until somebody zooms.
class ZoomWidget : public QWidget, public ReadableText {
public:
    struct Settings {
        ZoomPlace::Limits limits;
        /// A wheel makes larger and smaller; else it scrolls, and Ctrl makes it zoom.
        bool wheelZooms = false;
        bool scrollBars = false;
        /// Behind the content and beside it.
        Color ground = Color::clear;
    };

    ZoomWidget(std::unique_ptr<ZoomContent> content, const Settings& settings);
    ~ZoomWidget() override;

    ZoomContent& content() const { return *content_; }
    double zoom() const { return place_.zoom(); }
    /// That of all of it, or all of its width, in view.
    double fittingZoom() const { return place_.fittingZoom(); }
    /// The part of the content that is in view.
    QRectF visibleRect() const { return place_.visibleRect(); }
    void zoomBy(double factor);
    /// Makes larger in place of the view itself, where larger means laid out anew: for the buttons,
    /// the keys and the wheel.
    void setZoomHandler(std::function<void(double factor)> zoom) { zoomed_ = std::move(zoom); }
    /// That place of the content comes to the top, as far as there is enough below it.
    void showTop(double y);
    /// The content has another size now; the same share of it stays in view.
    void contentChanged();
    /// Called after every change of what is in view.
    void setMovedHandler(std::function<void()> moved) { moved_ = std::move(moved); }
    /// Called for a tap or click at a place of the content; answers whether that was for it. Else
    /// the second one zooms.
    void setTapHandler(std::function<bool(QPointF content)> tapped) { tapped_ = std::move(tapped); }
    /// Of content that is text.
    void setReadableText(const QString& text) { text_ = text; }
    QString readableText() const override { return text_; }

protected:
    bool event(QEvent* event) override;
    void paintEvent(QPaintEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void mouseDoubleClickEvent(QMouseEvent* event) override;
    void wheelEvent(QWheelEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;

private:
    struct Pinch {
        double distance;
        double zoom;
        QPointF content;
    };

    void zoomAround(double zoom, QPointF point);
    void toggleZoom(QPointF point);
    void fitAgain();
    bool moveBy(QPointF distance);
    bool touch(QTouchEvent& event);
    void pinch(const QTouchEvent& event);
    void tap(QPointF point);
    bool tappedTwice(QPointF point);
    void changed();
    void updateScrollBar(QScrollBar* bar) const;

    std::unique_ptr<ZoomContent> content_;
    const bool wheelZooms_;
    const Color ground_;
    ZoomPlace place_;
    std::optional<QPointF> dragged_;
    std::optional<Pinch> pinch_;
    std::optional<QPointF> tap_;
    std::optional<std::pair<Duration, QPointF>> lastTap_;
    Flinger flinger_;
    std::function<void()> moved_;
    std::function<bool(QPointF)> tapped_;
    std::function<void(double)> zoomed_;
    QString text_;
    /// None where the content goes without.
    QScrollBar* across_ = nullptr;
    QScrollBar* down_ = nullptr;
};

} // namespace platform
