#pragma once

#include "platform/base/Value.h"
#include "platform/ui/BarButtonItem.h"
#include "platform/ui/Traits.h"
#include "platform/ui/View.h"

#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace platform {

class NavigationController;

enum class PresentationStyle { fullScreen, overCurrentContext };

/// What goes on beside a change of size; blocks given to it run with the change and after it.
class TransitionCoordinator {
public:
    virtual ~TransitionCoordinator() = default;
    virtual void animateAlongside(std::function<void()> animation,
                                  std::function<void()> completion) = 0;
};

/// What keys ask of a screen when no control has used them.
enum class KeyCommand {
    /// Escape.
    cancel,
    /// Enter.
    confirm,
    /// Alt+Left, or a keyboard's or mouse's own back key.
    back,
    /// Ctrl+F.
    find,
    /// Ctrl+A.
    selectAll,
    /// The arrow, while the focus is in a field or on a button: leads to what the screen shows.
    down
};

/// Keys and values of state restoration.
using RestorationCoder = Value::Map;

/// A screen: owns a view, is told of its life, may show others over itself. Made with
/// std::make_shared. Main thread only.
class ViewController : public std::enable_shared_from_this<ViewController> {
public:
    ViewController();
    virtual ~ViewController();
    ViewController(const ViewController&) = delete;
    ViewController& operator=(const ViewController&) = delete;

    /// Loads the view at the first call (loadView, then viewDidLoad).
    std::shared_ptr<View> view();
    bool isViewLoaded() const;

    /// Makes the view and hands it to setView; the base makes a plain one.
    virtual void loadView();
    virtual void viewDidLoad();
    virtual void viewWillAppear(bool animated);
    virtual void viewDidAppear(bool animated);
    virtual void viewWillDisappear(bool animated);
    virtual void viewDidDisappear(bool animated);
    virtual void viewDidLayoutSubviews();
    /// The machine runs short of memory: drop what can be made again.
    virtual void didReceiveMemoryWarning();
    virtual void viewWillTransitionToSize(Size size, TransitionCoordinator& coordinator);

    /// Asked of the screens in view, the innermost first, until one answers true: the key is used.
    virtual bool performKeyCommand(KeyCommand command);

    std::string title() const;
    /// Also the navigation item's title.
    virtual void setTitle(std::string_view title);
    NavigationItem& navigationItem();
    const std::vector<BarButtonItem::Pointer>& toolbarItems() const;
    void setToolbarItems(std::vector<BarButtonItem::Pointer> items, bool animated = false);

    ViewController* parentViewController() const;
    const std::vector<std::shared_ptr<ViewController>>& childViewControllers() const;
    /// Adopts the child; the caller places its view and then tells it didMoveToParent.
    void addChildViewController(const std::shared_ptr<ViewController>& child);
    void removeFromParentViewController();
    virtual void didMoveToParent(ViewController* parent);
    /// The nearest navigation stack that holds this screen; none outside any.
    NavigationController* navigationController() const;

    /// Shows `screen` over this one's window (over the visible one when this screen has left), above
    /// what is presented already; `completion` runs when it has come in.
    void presentViewController(const std::shared_ptr<ViewController>& screen, bool animated,
                               std::function<void()> completion = {});
    /// Takes away what this screen presents or, when it presents nothing, this screen itself.
    void dismissViewController(bool animated, std::function<void()> completion = {});
    std::shared_ptr<ViewController> presentedViewController() const;
    ViewController* presentingViewController() const;
    PresentationStyle modalPresentationStyle() const;
    void setModalPresentationStyle(PresentationStyle style);

    /// Whether the view reaches below the status strip and below the bars of its navigation stack,
    /// over the whole window; else (at first) it fills what they leave free.
    bool extendsUnderBars() const;
    void setExtendsUnderBars(bool extends);

    /// Of the window that shows the screen; unspecified outside any.
    TraitCollection traitCollection() const;

    const std::string& restorationIdentifier() const;
    void setRestorationIdentifier(std::string_view identifier);
    virtual void encodeRestorableStateWithCoder(RestorationCoder& coder);
    virtual void decodeRestorableStateWithCoder(const RestorationCoder& coder);

    struct Impl;
    Impl& impl() const { return *impl_; }

protected:
    void setView(std::shared_ptr<View> view);

private:
    std::unique_ptr<Impl> impl_;
};

} // namespace platform
