#include "platform/ui/NavigationBar.h"

#include "platform/base/Text.h"
#include "platform/ui/BarButtonImpl.h"
#include "platform/ui/Direction.h"
#include "platform/ui/Theme.h"
#include "platform/ui/Window.h"
#include "platform/ui/qt/ButtonImpl.h"
#include "platform/ui/qt/FocusOrder.h"
#include "platform/ui/qt/ViewImpl.h"

#include <QApplication>

#include <algorithm>
#include <cmath>
#include <utility>

namespace platform {
namespace {

/// From the edge of the bar to the first button's own padding: its text stands at the page margin.
double edgeInset() {
    return pageMargin() - Theme::iconGap;
}

constexpr double gap = 8;
/// A back button with a title takes no more of the bar than this.
constexpr double widestBack = 0.45;
constexpr double widestRightSide = 0.6;
/// How far a title travels while the pages change.
constexpr double titleTravel = 48;
constexpr double backArrowPadding = 10;

Font titleFont() {
    return Font::preferred(TextStyle::headline).scaled(barTitleScale());
}

} // namespace

/// The back button, the title and the right-hand items of one screen.
class NavigationBar::Page : public View {
public:
    Page(const BarEntry& entry, const std::function<void()>& back) : backTitle_(entry.backTitle) {
        title_ = std::make_shared<Label>();
        title_->setFont(titleFont());
        title_->setLineBreak(LineBreak::elideMiddle);
        title_->setTextAlignment(TextAlignment::center);
        title_->impl().role = QAccessible::Heading;
        title_->setText(entry.title);
        if (backTitle_)
            addBackButton(back);
        addSubview(title_);
        for (const auto& item : entry.rightItems)
            addItem(item);
    }

    /// The stop of the Tab key that the focus has here, counted from the back button.
    int focusedStop() const {
        const QWidget* const widget = impl().widget;
        if (!widget)
            return -1;
        const std::vector<QWidget*> stops = focusOrder(*widget);
        const auto found = std::ranges::find(stops, QApplication::focusWidget());
        return found == stops.end() ? -1 : static_cast<int>(found - stops.begin());
    }
    void focusStop(int stop) const {
        const QWidget* const widget = impl().widget;
        const std::vector<QWidget*> stops = widget ? focusOrder(*widget) : std::vector<QWidget*>();
        if (stop >= 0 && !stops.empty())
            stops[std::min(static_cast<std::size_t>(stop), stops.size() - 1)]->setFocus(
                Qt::OtherFocusReason);
    }

protected:
    void layoutSubviews() override {
        title_->setFont(titleFont());
        scaleBarTitles(subviews(), barTitleScale());
        const double width = bounds().width;
        const double right = placeRightItems();
        const double left = placeBackButton(right);
        const double wanted = title_->intrinsicContentSize().width;
        const double margin = pageMargin();
        const double from = left > 0 ? left + gap : margin;
        const double to = width - (right > 0 ? right + gap : margin);
        const double room = std::max(0.0, to - from);
        const double titleWidth = std::min(wanted, room);
        // In the middle of the bar where that is free, else as near to it as the buttons let it.
        const double centred = (width - titleWidth) / 2;
        const double x = std::clamp(centred, from, std::max(from, to - titleWidth));
        title_->setFrame(
            mirrored({std::round(x), 0, std::ceil(titleWidth), bounds().height}, width));
    }

private:
    void addBackButton(const std::function<void()>& back) {
        back_ = std::make_shared<Button>(ButtonType::system);
        back_->setImage(Image::system(SystemImage::back));
        back_->setTitle(*backTitle_);
        implOf(*back_).padding = backArrowPadding;
        back_->setAccessibleName(backTitle_->empty() ? localized("Back")
                                                     : localized("Back") + ", " + *backTitle_);
        back_->addAction(ControlEvent::touchUpInside, back);
        addSubview(back_);
    }

    void addItem(const BarButtonItem::Pointer& item) {
        const auto view = makeBarView(item);
        if (view)
            addSubview(view);
        items_.push_back({view, item->systemItem()});
    }

    /// From the trailing edge inward; answers the width that they take.
    double placeRightItems() {
        const double limit = bounds().width * widestRightSide;
        double taken = items_.empty() ? 0 : edgeInset();
        for (const Item& item : items_) {
            if (!item.view) {
                taken += gap;
                continue;
            }
            const double width = std::min(barWidthOf(*item.view), std::max(0.0, limit - taken));
            const double wanted = item.view->intrinsicContentSize().height;
            const double height = std::min(
                wanted == noIntrinsicMetric ? item.view->frame().height : wanted, bounds().height);
            item.view->setFrame(
                mirrored({bounds().width - taken - width,
                          std::floor((bounds().height - height) / 2), width, height},
                         bounds().width));
            taken += width;
        }
        return taken;
    }

    /// With its title where it is short and leaves the title its room, else the arrow alone.
    double placeBackButton(double right) {
        if (!back_)
            return 0;
        const double whole = bounds().width;
        double width = back_->intrinsicContentSize().width;
        const double rest = whole - right - edgeInset() - width - 2 * gap;
        const bool arrowAlone =
            width > whole * widestBack || rest < title_->intrinsicContentSize().width;
        if (arrowAlone)
            width = Theme::minimumTarget;
        if (std::exchange(implOf(*back_).titleHidden, arrowAlone) != arrowAlone)
            back_->setNeedsDisplay();
        back_->setFrame(
            mirrored({edgeInset(), std::floor((bounds().height - Theme::minimumTarget) / 2), width,
                      Theme::minimumTarget},
                     whole));
        return edgeInset() + width;
    }

    struct Item {
        std::shared_ptr<View> view;
        std::optional<SystemItem> system;
    };

    std::optional<std::string> backTitle_;
    std::shared_ptr<Button> back_;
    std::shared_ptr<Label> title_;
    std::vector<Item> items_;
};

NavigationBar::NavigationBar() : hairline_(std::make_shared<View>()) {
    setBackgroundColor(Theme::bar);
    setDebugName("navigation bar");
    hairline_->setBackgroundColor(Theme::hairline);
    addSubview(hairline_);
}

NavigationBar::~NavigationBar() = default;

double NavigationBar::contentHeight() {
    return std::max(Theme::barHeight, titleFont().lineHeight() + 8);
}

void NavigationBar::setBackHandler(std::function<void()> handler) {
    back_ = std::move(handler);
}

std::shared_ptr<NavigationBar::Page> NavigationBar::makePage(const BarEntry& entry) {
    auto page = std::make_shared<Page>(entry, [this] {
        if (const auto handler = back_)
            handler();
    });
    insertSubview(page, 0);
    placePage(*page);
    return page;
}

void NavigationBar::placePage(Page& page) {
    const double height = std::min(contentHeight(), bounds().height);
    page.setFrame({0, bounds().height - height, bounds().width, height});
}

void NavigationBar::show(const BarEntry& entry) {
    std::shared_ptr<Page>& shown = next_ ? next_ : page_;
    const int focused = shown ? shown->focusedStop() : -1;
    if (shown) {
        // A button of this bar may be what is being pressed.
        keepUntilNextTurn(shown);
        shown->removeFromSuperview();
    }
    shown = makePage(entry);
    setProgress(progress_);
    if (focused >= 0) {
        layoutIfNeeded();
        shown->focusStop(focused);
    }
}

void NavigationBar::beginTransition(const BarEntry& next, bool forward) {
    endTransition(true);
    forward_ = forward;
    next_ = makePage(next);
    setProgress(0);
}

void NavigationBar::setProgress(double progress) {
    progress_ = progress;
    if (!next_)
        return;
    const double way = titleTravel * (forward_ ? 1 : -1) * readingSign();
    // The old title is nearly gone before the new one comes.
    next_->setAlpha(std::clamp((progress - 0.4) / 0.6, 0.0, 1.0));
    next_->impl().setTranslation({std::round(way * (1 - progress)), 0});
    if (page_) {
        page_->setAlpha(std::clamp(1 - progress / 0.5, 0.0, 1.0));
        page_->impl().setTranslation({std::round(-way * progress), 0});
    }
}

void NavigationBar::endTransition(bool completed) {
    if (!next_)
        return;
    const auto gone = completed ? page_ : next_;
    page_ = completed ? next_ : page_;
    next_ = nullptr;
    progress_ = 1;
    if (gone) {
        keepUntilNextTurn(gone);
        gone->removeFromSuperview();
    }
    page_->setAlpha(1);
    page_->impl().setTranslation({});
}

void NavigationBar::layoutSubviews() {
    const double line = window() ? 1 / window()->screenScale() : 1;
    hairline_->setFrame({0, bounds().height - line, bounds().width, line});
    if (page_)
        placePage(*page_);
    if (next_)
        placePage(*next_);
}

} // namespace platform
