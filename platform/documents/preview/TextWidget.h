#pragma once

#include "platform/documents/preview/Flinger.h"
#include "platform/documents/preview/TextColumn.h"

#include <QWidget>

#include <functional>

class QScrollBar;
class QTouchEvent;

namespace platform {

/// Shows the lines of a text around one place and asks for more before they run out.
class TextWidget : public QWidget {
public:
    /// What it wants read; answered by the three functions below, or not at all.
    struct Wishes {
        std::function<void(std::uint64_t offset)> linesFrom;
        std::function<void(std::uint64_t offset)> linesBefore;
        std::function<void(std::uint64_t offset)> linesAround;
    };
    explicit TextWidget(Wishes wishes);
    ~TextWidget() override;

    /// Puts these lines in place of all; the first that holds `top` is the first in view.
    void setLines(std::vector<TextLine> lines, std::uint64_t start, std::uint64_t size,
                  std::uint64_t top);
    void appendLines(std::vector<TextLine> lines);
    void prependLines(std::vector<TextLine> lines);
    /// Where the first line in view begins.
    std::uint64_t topOffset() const;
    void zoomBy(double factor);

protected:
    bool event(QEvent* event) override;
    void paintEvent(QPaintEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;
    void wheelEvent(QWheelEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;

private:
    void shape();
    double lineWidth() const;
    /// Answers whether the whole way was free.
    bool scrollBy(double distance);
    void askForMore();
    void updateScrollBar();
    void jumpTo(std::uint64_t offset);
    bool touch(QTouchEvent& event);
    void drag(QPointF point, bool first, bool last);

    Wishes wishes_;
    TextColumn column_;
    std::uint64_t start_ = 0;
    std::uint64_t size_ = 0;
    bool asksBefore_ = false;
    bool asksAfter_ = false;
    double zoom_ = 1;
    QScrollBar* scrollBar_;
    QPointF dragged_;
    Flinger flinger_;
};

} // namespace platform
