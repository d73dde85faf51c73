#pragma once

#include "platform/ui/Controls.h"

#include <functional>
#include <memory>
#include <vector>

namespace platform {

/// A picture and lines of text, one below the other in the middle of a screen that has nothing else
/// to show. Where there is too little room the picture goes first; then the texts become smaller,
/// so that none is ever cut.
class CenteredColumn : public View {
public:
    void setPicture(std::shared_ptr<View> picture);
    std::shared_ptr<Label> addText(TextStyle style, Color color, double gapAbove);
    /// A control of its own height, as wide as it wants to be.
    void addControl(std::shared_ptr<View> control, double gapAbove);
    /// Text on a ground of its own.
    std::shared_ptr<Label> addBox(Color ground, double gapAbove);

protected:
    void layoutSubviews() override;

private:
    struct Line {
        std::shared_ptr<View> view;
        std::shared_ptr<Label> label;
        TextStyle style = TextStyle::body;
        double gapAbove = 0;
        double padding = 0;
    };
    std::shared_ptr<Label> makeLabel(TextStyle style, Color color) const;
    double heightOf(const Line& line, double width, double scale) const;
    double columnHeight(double width, double scale) const;
    void placeLine(const Line& line, Rect frame) const;

    std::shared_ptr<View> picture_;
    std::vector<Line> lines_;
    /// Stands in no window: a text in a font that is only tried calls for no layout.
    std::shared_ptr<Label> measure_ = makeLabel(TextStyle::body, {});
};

} // namespace platform
