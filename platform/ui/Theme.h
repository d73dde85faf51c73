#pragma once

#include "platform/ui/Color.h"
#include "platform/ui/Font.h"

#include <chrono>

namespace platform {

/// Every value by which the program looks as it does. Sizes in points. One table, no state.
struct Theme {
    static constexpr Color page = Color::white;
    static constexpr Color bar = Color::hex(0xF7F8FA);
    static constexpr Color hairline = Color::hex(0xD5D9E0);
    static constexpr Color text = Color::hex(0x14171C);
    static constexpr Color secondaryText = Color::hex(0x5B6472);
    static constexpr Color accent = Color::hex(0x1E6AD6);
    static constexpr Color accentPressed = Color::hex(0x174FA0);
    static constexpr Color destructive = Color::hex(0xC62A3A);
    static constexpr Color selection = Color::hex(0xE4EEFC);
    static constexpr Color badge = Color::hex(0x7C8798);
    static constexpr double disabledAlpha = 0.35;
    static constexpr double dimAlpha = 0.32;
    static constexpr double shadowAlpha = 0.18;
    static constexpr double shadowOffset = 8;
    static constexpr double shadowRadius = 32;

    static constexpr double phoneMargin = 16;
    static constexpr double tabletMargin = 20;
    static constexpr double iconGap = 12;
    static constexpr double minimumTarget = 44;
    static constexpr double barHeight = 52;
    static constexpr double toolbarHeight = 48;
    static constexpr double statusStripHeight = 20;
    static constexpr double rowHeight = 64;
    static constexpr double containerRowHeight = 76;
    static constexpr double rowIcon = 40;
    static constexpr double containerIcon = 48;
    static constexpr double buttonCorner = 8;
    static constexpr double overlayCorner = 14;
    static constexpr double alertWidth = 288;
    static constexpr double lineHeightFactor = 1.3;

    static constexpr std::chrono::milliseconds pushTime{280};
    static constexpr std::chrono::milliseconds alertTime{180};
    static constexpr double alertStartScale = 0.96;
    static constexpr std::chrono::milliseconds loadingDelay{200};

    struct TextShape {
        double points;
        int weight;
    };
    static constexpr TextShape shapeOf(TextStyle style) {
        switch (style) {
        case TextStyle::title2:
            return {24, 600};
        case TextStyle::headline:
            return {17, 600};
        case TextStyle::body:
            return {17, 400};
        case TextStyle::subheadline:
            return {15, 400};
        case TextStyle::footnote:
            return {13, 400};
        case TextStyle::caption:
            return {12, 400};
        }
        return {17, 400};
    }
};

} // namespace platform
