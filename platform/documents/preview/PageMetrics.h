#pragma once

/// What all pages that can be scrolled have in common; lengths in points.
namespace platform::pageMetrics {

/// What the toolkit reports for one notch of a wheel, and how far that scrolls.
inline constexpr double notch = 120;
inline constexpr double stepPerNotch = 80;
inline constexpr int scrollBarWidth = 12;
/// The range of a scroll bar, whatever the length of its page.
inline constexpr int scrollBarSteps = 1'000'000;
/// The end of a page can be drawn above the buttons that float over it.
inline constexpr double edgeBelow = 112;

} // namespace platform::pageMetrics
