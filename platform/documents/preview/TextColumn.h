#pragma once

#include "platform/documents/preview/TextFile.h"

#include <QFont>
#include <QTextLayout>

#include <deque>
#include <functional>
#include <memory>
#include <vector>

class QPainter;

namespace platform {

/// The lines of a text around one place, wrapped to a width and laid out as they come near the
/// view; and which of them is at its top. Points; the view is as high as what text may fill.
class TextColumn {
public:
    /// The direction that lines begin in; LayoutDirectionAuto for each as its letters say.
    explicit TextColumn(Qt::LayoutDirection direction = Qt::LayoutDirectionAuto);
    ~TextColumn();

    bool isEmpty() const { return lines_.empty(); }
    /// Of what is known, in the file.
    std::uint64_t firstOffset() const { return lines_.front().line.offset; }
    std::uint64_t endOffset() const { return lines_.back().line.end; }
    bool holds(std::uint64_t offset) const;
    /// How many lines there are before and from the top one on.
    std::size_t linesBefore() const { return top_; }
    std::size_t linesFromTop() const { return lines_.size() - top_; }
    /// Where the first line in view begins. There must be lines.
    std::uint64_t topOffset() const { return lines_[top_].line.offset; }
    /// Where the last line in view ends.
    std::uint64_t bottomOffset();

    /// All that is known, in one.
    QString text() const;

    /// Puts these lines in place of all; the last that does not begin behind `top` is the first in
    /// view.
    void set(std::vector<TextLine> lines, std::uint64_t top);
    /// Those that do not join on to what is there are dropped.
    void append(std::vector<TextLine> lines);
    void prepend(std::vector<TextLine> lines);
    /// Wraps everything anew; the line at the top stays there.
    void setShape(const QFont& font, double width, double viewHeight);

    /// Answers whether the whole way was free.
    bool scrollBy(double distance);
    /// The line that holds the offset, which must be held, comes to the top.
    void goTo(std::uint64_t offset);
    /// The highest number of the lines that are known; 0 when they have none.
    std::uint64_t largestNumber() const;
    /// Paints something beside a line whose first row is at `y` and that high.
    using Aside = std::function<void(const TextLine& line, double y, double height)>;
    /// From the top of the view down to `bottom` below it.
    void paint(QPainter& painter, QPointF corner, double bottom, const Aside& aside = {});

private:
    struct Laid {
        TextLine line;
        /// None until it comes near the view.
        std::unique_ptr<QTextLayout> layout;
        double height = 0;
    };

    double heightOf(std::size_t index);
    void layOut(Laid& laid) const;
    void keepEndInView();
    double rowHeight() const;

    const Qt::LayoutDirection direction_;
    std::deque<Laid> lines_;
    std::size_t top_ = 0;
    /// How much of the top line is above the view.
    double above_ = 0;
    QFont font_;
    double width_ = 1;
    double viewHeight_ = 1;
};

} // namespace platform
