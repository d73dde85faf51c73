#pragma once

#include "platform/ui/Animation.h"
#include "platform/ui/NavigationBar.h"
#include "platform/ui/NavigationController.h"
#include "platform/ui/Toolbar.h"
#include "platform/ui/ViewControllerImpl.h"
#include "platform/ui/qt/EdgeSwipe.h"

#include <memory>
#include <vector>

namespace platform {

/// The screens of a navigation controller, the bars round them, and the change that is under way.
struct NavigationController::Stack {
    using Screen = std::shared_ptr<ViewController>;
    using Screens = std::vector<Screen>;

    /// From one top screen to another.
    struct Transition {
        /// Tells this one from another that took its place while somebody was told of it.
        unsigned number = 0;
        Screen from;
        Screen to;
        /// The stack before.
        Screens former;
        std::shared_ptr<View> fromPage;
        std::shared_ptr<View> toPage;
        bool forward = true;
        bool animated = true;
        /// A finger leads it, and nobody has been told of it yet.
        bool byFinger = false;
        double progress = 0;
        Animation animation;
    };

    explicit Stack(NavigationController& theOwner) : owner(theOwner) {}

    void build(View& view);
    void change(Screens wanted, bool animated);
    void finishTransition();

    // The pieces of a change.
    void adopt(const Screens& wanted);
    void release(const Screens& former);
    void begin(const Screen& from, const Screen& to, bool forward, bool animated);
    bool announce();
    void run();
    void showProgress(double progress);
    void end();
    /// The top screen has come, or the controller with it.
    void didShow(bool animated);

    // The finger.
    bool maySwipe() const;
    void beginSwipe();
    void endSwipe(bool far);
    void cancelSwipe();

    void step(AppearanceStep step, bool animated);
    Screen top() const { return screens.empty() ? nullptr : screens.back(); }
    bool isOnScreen() const { return owner.impl().isOnScreen(); }
    std::shared_ptr<View> makePage(const Screen& screen);
    void showTop();
    void placePage(View& page, const ViewController& screen);
    void layout();
    void follow(const Screen& screen);
    BarEntry entryFor(std::size_t index) const;
    void updateBar();
    void updateToolbar();
    double topInset() const;
    Rect barFrame() const;
    Rect toolbarFrame() const;

    NavigationController& owner;
    Screens screens;
    std::weak_ptr<NavigationControllerDelegate> delegate;
    std::shared_ptr<View> pages;
    std::shared_ptr<NavigationBar> bar;
    std::shared_ptr<Toolbar> toolbar;
    /// The line at the leading edge of the upper page while it slides.
    std::shared_ptr<View> edge;
    std::shared_ptr<View> topPage;
    std::unique_ptr<Transition> transition;
    std::unique_ptr<EdgeSwipe> swipe;
    Animation toolbarSlide;
    bool toolbarHidden = true;
    unsigned transitionCount = 0;
};

} // namespace platform
