#pragma once

#include "platform/ui/Controls.h"

#include <QRectF>
#include <QString>
#include <QTextLayout>

#include <memory>
#include <vector>

class QPainter;

namespace platform {

struct TextBlockStyle {
    Font font;
    /// 0 means as many as needed.
    int maximumLines = 1;
    LineBreak lineBreak = LineBreak::elideTail;
};

/// Text broken into the lines of one width, the last elided where the lines do not suffice.
class TextBlock {
public:
    /// Wide enough that nothing breaks but at line ends of the text itself.
    static constexpr double unlimitedWidth = 1e6;

    TextBlock(const QString& text, const TextBlockStyle& style, double width);

    /// Whole points; the width is that of the longest line.
    QSizeF size() const { return size_; }
    bool isElided() const { return last_ != nullptr; }
    /// Draws with the pen's colour; the block is centred vertically in `bounds`.
    void draw(QPainter& painter, const QRectF& bounds, TextAlignment alignment) const;

private:
    struct Line {
        const QTextLayout* layout;
        int index;
        double top;
        double ascent;
    };
    void breakLines(double width);
    void elideLast(const QString& text, const TextBlockStyle& style, double width);
    void stack(const Font& font);
    QTextLine lineAt(const Line& line) const;

    std::unique_ptr<QTextLayout> layout_;
    std::unique_ptr<QTextLayout> last_;
    std::vector<Line> lines_;
    QSizeF size_;
};

/// The blocks of one text at the few widths for which layout and painting ask in turn.
class TextBlockCache {
public:
    const TextBlock& block(const QString& text, const TextBlockStyle& style, double width) const;
    /// The text or its style changed.
    void clear() { entries_.clear(); }

private:
    struct Entry {
        double width;
        int maximumLines;
        double points;
        std::unique_ptr<TextBlock> block;
    };
    static constexpr std::size_t capacity = 3;
    mutable std::vector<Entry> entries_;
};

} // namespace platform
