#pragma once

#include "platform/ui/BarButtonItem.h"
#include "platform/ui/Controls.h"

namespace platform {

/// A bar item's content and the view that shows it now; for sources of the toolkit.
struct BarButtonItem::Impl {
    std::string title;
    BarStyle style = BarStyle::plain;
    std::optional<SystemItem> system;
    Image image;
    std::string accessibleName;
    std::shared_ptr<View> custom;
    Action action;
    bool enabled = true;
    std::weak_ptr<View> shown;

    bool isSpace() const {
        return system == SystemItem::flexibleSpace || system == SystemItem::fixedSpace;
    }
};

/// The view that shows the item in a bar: its custom view, else a new button. None for a space.
std::shared_ptr<View> makeBarView(const BarButtonItem::Pointer& item);

/// The width that a bar gives to the view.
double barWidthOf(const View& view);

/// Bars have a fixed height: their titles follow the user's text scale only up to half again.
double barTitleScale();

/// Draws the titles of the bar's own buttons smaller or larger, so that all of them fit.
void scaleBarTitles(const std::vector<std::shared_ptr<View>>& views, double scale);

} // namespace platform
