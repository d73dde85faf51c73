#pragma once

#include "platform/ui/Controls.h"
#include "platform/ui/qt/TextBlock.h"
#include "platform/ui/qt/ViewImpl.h"

#include <optional>
#include <string>

namespace platform {

/// A label's text and its lines at the width it was last asked for.
struct LabelImpl : View::Impl {
    LabelImpl();

    void paintContent(QPainter& painter, const QRectF& bounds) override;
    void settingsChanged() override;
    QAccessible::Role accessibleRole() const override;
    QString accessibleText() const override;

    void textChanged();
    TextBlockStyle style() const { return {font, lines, lineBreak}; }
    const TextBlock& blockFor(double width) const;
    Size styledSize() const;
    void paintStyled(QPainter& painter, const QRectF& bounds) const;

    std::string text;
    /// Takes the place of the plain text when it has runs.
    StyledText styled;
    Font font = Font::preferred(TextStyle::body);
    Color color;
    TextAlignment alignment = TextAlignment::natural;
    int lines = 1;
    LineBreak lineBreak = LineBreak::elideTail;
    TextBlockCache blocks;
};

} // namespace platform
