#pragma once

#include "platform/base/Clock.h"
#include "platform/ui/ViewController.h"

#include <optional>

namespace platform {

/// Where a screen is in its life on the display.
enum class Appearance { gone, appearing, here, leaving };
enum class AppearanceStep { willAppear, didAppear, willDisappear, didDisappear };

/// A screen's state; for sources of the toolkit.
struct ViewController::Impl {
    /// How a screen comes in over others, where it does not rise from the bottom: called with 0
    /// (away) to 1 (in place).
    struct Entrance {
        Duration time;
        std::function<void(double progress)> step;
    };

    /// Walks the screen, and those that appear with it, one step on. A step that does not follow
    /// from the present state does nothing, so each callback comes once and in order.
    void take(AppearanceStep step, bool animated);
    bool isOnScreen() const { return state == Appearance::appearing || state == Appearance::here; }

    View* loadedView() const { return view.get(); }
    /// The topmost ancestor; itself without a parent.
    ViewController& topAncestor() const;
    Window* window() const;
    /// The size of the window's part that the screen fills is about to change.
    void sizeWillChange(Size size, TransitionCoordinator& coordinator);
    /// Innermost first; true when somebody used it.
    bool sendKeyCommand(KeyCommand command);

    ViewController* self = nullptr;
    std::shared_ptr<View> view;
    bool loading = false;
    bool loaded = false;
    ViewController* parent = nullptr;
    std::vector<std::shared_ptr<ViewController>> children;
    std::string title;
    NavigationItem navigationItem;
    std::vector<BarButtonItem::Pointer> toolbarItems;
    /// The stack that shows the screen hears of new toolbar items.
    std::function<void(bool animated)> toolbarItemsChanged;
    Appearance state = Appearance::gone;
    bool underBars = false;
    PresentationStyle presentationStyle = PresentationStyle::fullScreen;
    std::string restorationIdentifier;
    /// Set while the screen is presented.
    Window* presentedIn = nullptr;

    // A container that shows its children one at a time says how.
    /// In place of telling every child.
    std::function<void(AppearanceStep, bool animated)> forwardStep;
    /// The child to which key commands go first.
    std::function<ViewController*()> visibleChild;
    std::optional<Entrance> entrance;
    /// Lies over the others without taking their place (an alert).
    bool isOverlay = false;
    /// What screen readers call it while it stands before others; its title when it is empty.
    std::string dialogName;
    /// Where the keyboard goes when the screen has come in.
    std::function<void()> takeInitialFocus;
};

} // namespace platform
