#pragma once

#include "platform/documents/preview/Flinger.h"
#include "platform/documents/preview/ReadableText.h"
#include "platform/documents/preview/TextColumn.h"

#include <QWidget>

#include <functional>

class QScrollBar;
class QTouchEvent;

namespace platform {

/// Shows the lines of a text around one place and asks for more before they run out.
class TextWidget : public QWidget, public ReadableText {
public:
    /// What it wants read; answered by the three functions below, or not at all.
    struct Wishes {
        std::function<void(std::uint64_t offset)> linesFrom;
        std::function<void(std::uint64_t offset)> linesBefore;
        std::function<void(std::uint64_t offset)> linesAround;
    };
    enum class Style {
        prose,
        /// Numbered lines that always run to the right.
        code
    };
    TextWidget(Wishes wishes, Style style);
    ~TextWidget() override;

    /// Puts these lines in place of all; the first that holds `top` is the first in view.
    void setLines(std::vector<TextLine> lines, std::uint64_t start, std::uint64_t size,
                  std::uint64_t top);
    void appendLines(std::vector<TextLine> lines);
    void prependLines(std::vector<TextLine> lines);
    /// Where the first line in view begins.
    std::uint64_t topOffset() const;
    void zoomBy(double factor);
    /// The lines that it has at the moment.
    QString readableText() const override { return column_.text(); }

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
    void linesChanged();
    /// The strip of the numbers.
    double gutterWidth() const;
    double textLeft() const;
    double lineWidth() const;
    void paintGutter(QPainter& painter) const;
    void paintNumber(QPainter& painter, const TextLine& line, double y, double height) const;
    /// Answers whether the whole way was free.
    bool scrollBy(double distance);
    void askForMore();
    void updateScrollBar();
    void jumpTo(std::uint64_t offset);
    bool touch(QTouchEvent& event);
    void drag(QPointF point, bool first, bool last);

    Wishes wishes_;
    const Style style_;
    TextColumn column_;
    std::uint64_t start_ = 0;
    std::uint64_t size_ = 0;
    bool asksBefore_ = false;
    bool asksAfter_ = false;
    double zoom_ = 1;
    /// Room for that many figures of a line's number.
    int figures_ = 0;
    QScrollBar* scrollBar_;
    QPointF dragged_;
    Flinger flinger_;
};

} // namespace platform
