#pragma once

#include "platform/ui/ViewController.h"

namespace platform {

class NavigationController;

class NavigationControllerDelegate {
public:
    virtual ~NavigationControllerDelegate() = default;
    /// `screen` is about to come to the top by a push, a pop or a set.
    virtual void navigationControllerWillShowViewController(NavigationController& /*navigation*/,
                                                            ViewController& /*screen*/,
                                                            bool /*animated*/) {}
    /// The transition has ended and `screen` is on top.
    virtual void navigationControllerDidShowViewController(NavigationController& /*navigation*/,
                                                           ViewController& /*screen*/,
                                                           bool /*animated*/) {}
};

/// A stack of screens below one navigation bar (back, title, right buttons) and above one bottom
/// toolbar. The back button, Alt+Left and a swipe from the leading edge pop. A change asked for
/// while a transition runs is carried out at once: the running one jumps to its end.
class NavigationController : public ViewController {
public:
    NavigationController();
    ~NavigationController() override;

    const std::vector<std::shared_ptr<ViewController>>& viewControllers() const;
    /// Replaces the whole stack; a new top slides in when animated.
    void setViewControllers(std::vector<std::shared_ptr<ViewController>> screens, bool animated);
    void pushViewController(std::shared_ptr<ViewController> screen, bool animated);
    /// Answers the screen that left; none when there is only one.
    std::shared_ptr<ViewController> popViewController(bool animated);
    /// None when the stack is empty.
    std::shared_ptr<ViewController> topViewController() const;

    void setDelegate(std::weak_ptr<NavigationControllerDelegate> delegate);

    /// In the coordinates of this controller's view.
    Rect navigationBarFrame() const;
    Rect toolbarFrame() const;
    bool isToolbarHidden() const;
    void setToolbarHidden(bool hidden, bool animated);

    bool performKeyCommand(KeyCommand command) override;
    void loadView() override;
    void viewDidLayoutSubviews() override;

    struct Stack;

private:
    std::unique_ptr<Stack> stack_;
};

} // namespace platform
