#include "platform/ui/Toolbar.h"

#include "platform/ui/BarButtonImpl.h"
#include "platform/ui/Direction.h"
#include "platform/ui/Theme.h"
#include "platform/ui/Window.h"
#include "platform/ui/qt/Settings.h"
#include "platform/ui/qt/ViewImpl.h"

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

/// A button's own padding stands within the page margin.
double edgeInset() {
    return pageMargin() - Theme::iconGap;
}

constexpr double fixedSpace = 8;
/// Titles are not drawn smaller than this to make them fit; then they elide.
constexpr double smallestTitleScale = 0.55;

} // namespace

/// The items side by side.
class Toolbar::Row : public View {
public:
    explicit Row(const std::vector<BarButtonItem::Pointer>& items) {
        for (const auto& item : items) {
            const auto view = makeBarView(item);
            if (view)
                addSubview(view);
            entries_.push_back({view, item->systemItem() == SystemItem::flexibleSpace});
            if (view)
                views_.push_back(view);
        }
    }

protected:
    void layoutSubviews() override {
        const double room = bounds().width - 2 * edgeInset();
        double scale = barTitleScale();
        // With large text it may go down to the usual size.
        const double smallest = std::min(smallestTitleScale, 1 / textScale());
        while (scale > smallest && naturalWidth(scale) > room)
            scale = std::max(smallest, scale - 0.05);
        scaleBarTitles(views_, scale);
        // What still does not fit is shared out; labels and titles elide.
        const double wanted = naturalWidth(scale);
        const double squeeze = wanted > room && wanted > 0 ? room / wanted : 1;
        const auto springs = static_cast<double>(
            std::ranges::count_if(entries_, [](const Entry& each) { return each.flexible; }));
        const double spring = springs > 0 ? std::max(0.0, room - wanted) / springs : 0;
        double x = edgeInset();
        for (const Entry& entry : entries_) {
            const double width = entry.flexible ? spring : widthOf(entry) * squeeze;
            if (entry.view)
                place(*entry.view, x, width);
            x += width;
        }
    }

private:
    struct Entry {
        std::shared_ptr<View> view;
        bool flexible;
    };

    static double widthOf(const Entry& entry) {
        if (entry.flexible)
            return 0;
        return entry.view ? barWidthOf(*entry.view) : fixedSpace;
    }

    double naturalWidth(double scale) const {
        scaleBarTitles(views_, scale);
        double width = 0;
        for (const Entry& entry : entries_)
            width += widthOf(entry);
        return width;
    }

    void place(View& view, double x, double width) const {
        const double wanted = view.intrinsicContentSize().height;
        const double height =
            std::min(wanted == noIntrinsicMetric ? view.frame().height : wanted, bounds().height);
        view.setFrame(mirrored(
            {std::round(x), std::floor((bounds().height - height) / 2), std::floor(width), height},
            bounds().width));
    }

    std::vector<Entry> entries_;
    std::vector<std::shared_ptr<View>> views_;
};

Toolbar::Toolbar() : hairline_(std::make_shared<View>()) {
    setBackgroundColor(Theme::bar);
    setDebugName("toolbar");
    hairline_->setBackgroundColor(Theme::hairline);
    addSubview(hairline_);
}

double Toolbar::height() {
    return std::max(Theme::toolbarHeight, Font::preferred(TextStyle::body).lineHeight() + 4);
}

void Toolbar::setItems(const std::vector<BarButtonItem::Pointer>& items) {
    if (row_) {
        // One of the items may be what is being pressed.
        keepUntilNextTurn(row_);
        row_->removeFromSuperview();
    }
    row_ = std::make_shared<Row>(items);
    addSubview(row_);
    row_->setFrame(bounds());
}

void Toolbar::setItemsAlpha(double alpha) {
    if (row_)
        row_->setAlpha(alpha);
}

void Toolbar::layoutSubviews() {
    const double line = window() ? 1 / window()->screenScale() : 1;
    hairline_->setFrame({0, 0, bounds().width, line});
    if (row_)
        row_->setFrame(bounds());
}

} // namespace platform
