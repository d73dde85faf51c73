#pragma once

#include <QWidget>

namespace platform {

class Window;

/// The real window: passes sizes, keys, closing and the walk of the Tab key on to ours.
class WindowWidget : public QWidget {
public:
    explicit WindowWidget(Window& window) : window_(&window) {}
    /// The window goes away before its widget.
    void detach() { window_ = nullptr; }
    /// Asks for one layout pass at the end of this turn of the event loop.
    void postLayout();
    /// What the keyboard can reach at the moment; none when the window has gone.
    const QWidget* focusScope() const;

protected:
    bool event(QEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void closeEvent(QCloseEvent* event) override;
    bool focusNextPrevChild(bool next) override;

private:
    Window* window_;
    bool layoutPosted_ = false;
};

} // namespace platform
