#pragma once

#include <QWidget>

namespace platform {

/// The widget of a plain view: paints what the view's Impl paints and turns a press into the tap.
class ViewWidget : public QWidget {
public:
    using QWidget::QWidget;

protected:
    bool event(QEvent* event) override;
    void paintEvent(QPaintEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;
};

/// Paints the ring that tells where the keyboard is, just inside `bounds`.
void paintFocusRing(QPainter& painter, const QRectF& bounds, double cornerRadius);

/// Lets the screen reader see the toolkit's own widgets as what they are. Once a process.
void installAccessibility();

} // namespace platform
