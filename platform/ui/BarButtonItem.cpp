#include "platform/ui/BarButtonItem.h"

#include "platform/base/Text.h"
#include "platform/ui/BarButtonImpl.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/ButtonImpl.h"
#include "platform/ui/qt/Settings.h"

#include <algorithm>

namespace platform {
namespace {

/// What a system item shows: a title or a picture with a name for it.
void describeSystemItem(BarButtonItem::Impl& impl, SystemItem item) {
    impl.system = item;
    switch (item) {
    case SystemItem::cancel:
        impl.title = localized("Cancel");
        break;
    case SystemItem::done:
        impl.title = localized("Done");
        impl.style = BarStyle::done;
        break;
    case SystemItem::organize:
        impl.image = Image::system(SystemImage::organize);
        impl.accessibleName = localized("Move");
        break;
    case SystemItem::trash:
        impl.image = Image::system(SystemImage::trash);
        impl.accessibleName = localized("Delete");
        break;
    case SystemItem::action:
        impl.image = Image::system(SystemImage::action);
        impl.accessibleName = localized("Share");
        break;
    case SystemItem::flexibleSpace:
    case SystemItem::fixedSpace:
        break;
    }
}

void setViewEnabled(View& view, bool enabled) {
    if (auto* const button = dynamic_cast<Button*>(&view))
        button->setEnabled(enabled);
    else if (auto* const field = dynamic_cast<TextField*>(&view))
        field->setEnabled(enabled);
}

} // namespace

BarButtonItem::BarButtonItem(std::unique_ptr<Impl> impl) : impl_(std::move(impl)) {
}

BarButtonItem::~BarButtonItem() = default;

BarButtonItem::Pointer BarButtonItem::withTitle(std::string_view title, BarStyle style,
                                                Action action) {
    auto impl = std::make_unique<Impl>();
    impl->title = title;
    impl->style = style;
    impl->action = std::move(action);
    return Pointer(new BarButtonItem(std::move(impl)));
}

BarButtonItem::Pointer BarButtonItem::withSystemItem(SystemItem item, Action action) {
    auto impl = std::make_unique<Impl>();
    describeSystemItem(*impl, item);
    impl->action = std::move(action);
    return Pointer(new BarButtonItem(std::move(impl)));
}

BarButtonItem::Pointer BarButtonItem::withImage(const Image& image, std::string_view accessibleName,
                                                Action action) {
    auto impl = std::make_unique<Impl>();
    impl->image = image;
    impl->accessibleName = accessibleName;
    impl->action = std::move(action);
    return Pointer(new BarButtonItem(std::move(impl)));
}

BarButtonItem::Pointer BarButtonItem::withCustomView(std::shared_ptr<View> view) {
    auto impl = std::make_unique<Impl>();
    impl->custom = std::move(view);
    return Pointer(new BarButtonItem(std::move(impl)));
}

bool BarButtonItem::isEnabled() const {
    if (const auto* const button = dynamic_cast<const Button*>(impl_->custom.get()))
        return button->isEnabled();
    return impl_->enabled;
}

void BarButtonItem::setEnabled(bool enabled) {
    impl_->enabled = enabled;
    if (impl_->custom)
        setViewEnabled(*impl_->custom, enabled);
    else if (const auto shown = impl_->shown.lock())
        setViewEnabled(*shown, enabled);
}

const std::string& BarButtonItem::title() const {
    return impl_->title;
}

std::optional<SystemItem> BarButtonItem::systemItem() const {
    return impl_->system;
}

std::shared_ptr<View> BarButtonItem::customView() const {
    return impl_->custom;
}

void BarButtonItem::perform() {
    if (!isEnabled())
        return;
    const auto keep = shared_from_this();
    if (auto* const button = dynamic_cast<Button*>(impl_->custom.get()))
        button->sendActions(ControlEvent::touchUpInside);
    else if (const Action action = impl_->action)
        action(*this);
}

View* BarButtonItem::shownView() const {
    const auto view = impl_->custom ? impl_->custom : impl_->shown.lock();
    return view && view->window() ? view.get() : nullptr;
}

std::shared_ptr<View> makeBarView(const BarButtonItem::Pointer& item) {
    BarButtonItem::Impl& impl = item->impl();
    if (impl.isSpace())
        return nullptr;
    if (impl.custom) {
        impl.custom->setLaidOutByConstraints(false);
        return impl.custom;
    }
    auto button = std::make_shared<Button>(ButtonType::system);
    if (impl.image.empty()) {
        button->setTitle(impl.title);
        button->setTitleFont(
            Font::preferred(impl.style == BarStyle::done ? TextStyle::headline : TextStyle::body));
    } else {
        button->setImage(impl.image);
        implOf(*button).padding = (Theme::minimumTarget - impl.image.size().width) / 2;
    }
    button->setAccessibleName(impl.accessibleName.empty() ? impl.title : impl.accessibleName);
    button->setEnabled(impl.enabled);
    button->addAction(ControlEvent::touchUpInside, [weak = std::weak_ptr(item)] {
        if (const auto self = weak.lock())
            self->perform();
    });
    impl.shown = button;
    return button;
}

double barWidthOf(const View& view) {
    const double natural = view.intrinsicContentSize().width;
    return natural == noIntrinsicMetric ? view.frame().width : natural;
}

double barTitleScale() {
    constexpr double largest = 1.5;
    return std::min(1.0, largest / textScale());
}

void scaleBarTitles(const std::vector<std::shared_ptr<View>>& views, double scale) {
    for (const auto& view : views) {
        auto* const button = dynamic_cast<Button*>(view.get());
        if (!button || implOf(*button).titleScale == scale)
            continue;
        implOf(*button).titleScale = scale;
        button->setNeedsDisplay();
    }
}

struct NavigationItem::State {
    std::string title;
    std::vector<BarButtonItem::Pointer> rightItems;
    bool hidesBack = false;
    std::function<void()> changed;

    void notify() const {
        if (changed)
            changed();
    }
};

NavigationItem::NavigationItem() : state_(std::make_unique<State>()) {
}

NavigationItem::~NavigationItem() = default;

const std::string& NavigationItem::title() const {
    return state_->title;
}

void NavigationItem::setTitle(std::string_view title) {
    if (state_->title == title)
        return;
    state_->title = title;
    state_->notify();
}

const std::vector<BarButtonItem::Pointer>& NavigationItem::rightBarButtonItems() const {
    return state_->rightItems;
}

void NavigationItem::setRightBarButtonItems(std::vector<BarButtonItem::Pointer> items) {
    state_->rightItems = std::move(items);
    state_->notify();
}

BarButtonItem::Pointer NavigationItem::rightBarButtonItem() const {
    return state_->rightItems.empty() ? nullptr : state_->rightItems.front();
}

void NavigationItem::setRightBarButtonItem(BarButtonItem::Pointer item) {
    state_->rightItems.clear();
    if (item)
        state_->rightItems.push_back(std::move(item));
    state_->notify();
}

bool NavigationItem::hidesBackButton() const {
    return state_->hidesBack;
}

void NavigationItem::setHidesBackButton(bool hidden, bool /*animated*/) {
    if (state_->hidesBack == hidden)
        return;
    state_->hidesBack = hidden;
    state_->notify();
}

void NavigationItem::setChangeHandler(std::function<void()> handler) {
    state_->changed = std::move(handler);
}

} // namespace platform
