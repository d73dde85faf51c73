#pragma once

#include "platform/ui/Image.h"
#include "platform/ui/View.h"

#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace platform {

enum class BarStyle { plain, done };
enum class SystemItem { cancel, done, flexibleSpace, fixedSpace, organize, trash, action };

/// A button, a space or a view of a navigation bar or a bottom toolbar. The same item may stand
/// twice in one bar (a flexible space). Main thread.
class BarButtonItem : public std::enable_shared_from_this<BarButtonItem> {
public:
    using Pointer = std::shared_ptr<BarButtonItem>;
    using Action = std::function<void(BarButtonItem& sender)>;

    static Pointer withTitle(std::string_view title, BarStyle style, Action action);
    static Pointer withSystemItem(SystemItem item, Action action = {});
    static Pointer withImage(const Image& image, std::string_view accessibleName, Action action);
    static Pointer withCustomView(std::shared_ptr<View> view);
    ~BarButtonItem();
    BarButtonItem(const BarButtonItem&) = delete;
    BarButtonItem& operator=(const BarButtonItem&) = delete;

    bool isEnabled() const;
    /// Enables or disables the button, or the control that is the custom view.
    void setEnabled(bool enabled);
    const std::string& title() const;
    std::optional<SystemItem> systemItem() const;
    std::shared_ptr<View> customView() const;
    /// What pressing it does.
    void perform();
    /// The view that shows the item while it stands in a visible bar; none otherwise.
    View* shownView() const;

    struct Impl;
    Impl& impl() const { return *impl_; }

private:
    explicit BarButtonItem(std::unique_ptr<Impl> impl);
    std::unique_ptr<Impl> impl_;
};

/// A screen's entry in the navigation bar. Changes show at once while the screen is on top.
class NavigationItem {
public:
    NavigationItem();
    ~NavigationItem();
    NavigationItem(const NavigationItem&) = delete;
    NavigationItem& operator=(const NavigationItem&) = delete;

    const std::string& title() const;
    void setTitle(std::string_view title);
    /// The first stands at the trailing edge.
    const std::vector<BarButtonItem::Pointer>& rightBarButtonItems() const;
    void setRightBarButtonItems(std::vector<BarButtonItem::Pointer> items);
    BarButtonItem::Pointer rightBarButtonItem() const;
    void setRightBarButtonItem(BarButtonItem::Pointer item);
    bool hidesBackButton() const;
    void setHidesBackButton(bool hidden, bool animated);
    /// Called by the bar that shows it, to hear of changes.
    void setChangeHandler(std::function<void()> handler);

private:
    struct State;
    std::unique_ptr<State> state_;
};

} // namespace platform
