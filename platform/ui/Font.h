#pragma once

#include <string_view>

namespace platform {

/// The text styles of the theme; sizes and weights stand in Theme.h.
enum class TextStyle { title2, headline, body, subheadline, footnote, caption };

/// A font of the program's typeface: a style at its preferred size, or at one of its own. A value.
class Font {
public:
    /// The style at the size that the user's text scale asks for.
    static Font preferred(TextStyle style);
    /// The style's weight at a given size in points, scaled by the user's text scale as well.
    static Font withSize(TextStyle style, double points);

    TextStyle style() const { return style_; }
    /// At the user's text scale of this moment.
    double pointSize() const;
    /// 400 is regular, 600 is semi-bold.
    int weight() const { return weight_; }

    /// Metrics of the theme's line box in points: the ascender reaches from its top to the
    /// baseline, the descender is negative and reaches to its bottom.
    double lineHeight() const;
    double ascender() const;
    double descender() const;
    double capHeight() const;
    /// The width of one line of text.
    double width(std::string_view text) const;

    /// The same style and weight at `factor` times the size.
    Font scaled(double factor) const { return {style_, points_ * factor, weight_}; }

    bool operator==(const Font&) const = default;

private:
    Font(TextStyle style, double points, int weight)
        : style_(style), points_(points), weight_(weight) {}
    TextStyle style_;
    double points_;
    int weight_;
};

} // namespace platform
