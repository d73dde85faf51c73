#pragma once

#include "platform/ui/Animation.h"
#include "platform/ui/ViewController.h"

#include <QPointer>

#include <functional>
#include <memory>
#include <vector>

class QWidget;

namespace platform {

/// The screens shown over a window's root screen: a chain in which each presents the next. A new
/// one goes on top, whoever asked for it; one that is dismissed leaves the chain at once and the
/// display when its animation ends.
class Presentations {
public:
    using Completion = std::function<void()>;

    explicit Presentations(Window& window) : window_(window) {}

    void present(const std::shared_ptr<ViewController>& screen, bool animated,
                 Completion completion);
    /// Takes away what `screen` (the root or a presented one) presents, else itself.
    void dismissFrom(ViewController& screen, bool animated, Completion completion);
    /// Takes away this one and leaves what is above it.
    void dismissOne(ViewController& screen, bool animated, Completion completion);
    void dismissAll();

    std::shared_ptr<ViewController> presentedBy(const ViewController& screen) const;
    ViewController* presenterOf(const ViewController& screen) const;
    /// None while nothing is presented.
    std::shared_ptr<ViewController> top() const;
    /// The view over the whole window in which the topmost stands; none while nothing is presented.
    View* topHost() const;
    /// All of them, also those on their way out: bottom first.
    std::vector<std::shared_ptr<ViewController>> screens() const;
    /// Gives every screen its place; called when the window's size or the strip's height changed.
    void place();
    /// Where the status strip belongs among the hosts: above the last one that takes the whole
    /// window's place.
    std::shared_ptr<View> lastCoveringHost() const;

private:
    struct Presentation {
        std::shared_ptr<ViewController> screen;
        std::shared_ptr<View> host;
        Animation animation;
        QPointer<QWidget> focusBefore;
        bool covers = false;
        Completion completion;
    };
    using Pointer = std::shared_ptr<Presentation>;

    std::size_t indexOf(const ViewController& screen) const;
    /// The screen whose place the one at `index` takes when it covers.
    std::shared_ptr<ViewController> contextBelow(std::size_t index) const;
    void cameIn(const Pointer& presentation, const std::shared_ptr<ViewController>& covered,
                bool animated);
    void remove(std::size_t index, bool animated, Completion completion);
    void wentOut(const Pointer& presentation, const std::shared_ptr<ViewController>& uncovered,
                 bool animated);
    void animate(const Pointer& presentation, bool in, bool animated, Completion done);
    static void sayWhatItIs(const Presentation& presentation, bool inForce);
    void restoreFocus(const Presentation& presentation, std::size_t index) const;
    void place(const Presentation& presentation) const;

    Window& window_;
    std::vector<Pointer> chain_;
    std::vector<Pointer> leaving_;
};

} // namespace platform
