#pragma once

#include "platform/ui/BarButtonItem.h"
#include "platform/ui/Controls.h"

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace platform {

/// What the bar shows for one screen.
struct BarEntry {
    std::string title;
    /// The title of the screen below; none where there is no way back.
    std::optional<std::string> backTitle;
    std::vector<BarButtonItem::Pointer> rightItems;
};

/// The bar at the top of a navigation stack. The bar may reach up under the status strip; its
/// content then stands in the lowest `contentHeight` points.
class NavigationBar : public View {
public:
    NavigationBar();
    ~NavigationBar() override;

    /// At least the theme's; more when the user's text needs it.
    static double contentHeight();

    void setBackHandler(std::function<void()> handler);
    /// Shows the entry at once: in place of what is shown or, within a transition, of what comes.
    void show(const BarEntry& entry);
    /// The next entry fades and slides in as the progress goes from 0 to 1.
    void beginTransition(const BarEntry& next, bool forward);
    void setProgress(double progress);
    /// Keeps the next entry, or the one before when the way was not gone to its end.
    void endTransition(bool completed);

protected:
    void layoutSubviews() override;

private:
    class Page;
    std::shared_ptr<Page> makePage(const BarEntry& entry);
    void placePage(Page& page);

    std::function<void()> back_;
    std::shared_ptr<Page> page_;
    std::shared_ptr<Page> next_;
    std::shared_ptr<View> hairline_;
    bool forward_ = true;
    double progress_ = 1;
};

} // namespace platform
