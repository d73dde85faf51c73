#pragma once

#include "platform/ui/Controls.h"
#include "platform/ui/ViewController.h"

namespace platform {

enum class AlertStyle { actionSheet, alert };
enum class ActionStyle { standard, cancel, destructive };
enum class ArrowDirection : unsigned { any = 0, up = 1, down = 2, left = 4, right = 8 };
constexpr ArrowDirection operator|(ArrowDirection a, ArrowDirection b) {
    return static_cast<ArrowDirection>(static_cast<unsigned>(a) | static_cast<unsigned>(b));
}

/// One choice of an alert.
class AlertAction {
public:
    using Pointer = std::shared_ptr<AlertAction>;
    using Handler = std::function<void(AlertAction& action)>;

    static Pointer make(std::string_view title, ActionStyle style, Handler handler = {});

    const std::string& title() const { return title_; }
    ActionStyle style() const { return style_; }
    bool isEnabled() const { return enabled_; }
    void setEnabled(bool enabled);
    /// Asked when the action is chosen: false keeps the alert open and its handler silent.
    void setShouldDismissHandler(std::function<bool()> handler) {
        shouldDismiss_ = std::move(handler);
    }
    /// Called by the alert that shows it, to hear of changes.
    void setChangeHandler(std::function<void()> handler) { changed_ = std::move(handler); }

    bool mayDismiss() const { return !shouldDismiss_ || shouldDismiss_(); }
    void run();
    /// Drops all handlers, and with them what they hold: the alert has had its answer.
    void release();

    AlertAction(std::string_view title, ActionStyle style, Handler handler);

private:
    std::string title_;
    ActionStyle style_;
    Handler handler_;
    bool enabled_ = true;
    std::function<bool()> shouldDismiss_;
    std::function<void()> changed_;
};

/// A question over the window: a centred alert (with text fields and a content area), or a sheet of
/// actions at the bottom of a phone and at its anchor on a tablet. Present it like any screen; it
/// dismisses itself when an action is chosen. Escape takes the cancel action, Enter the default.
/// Shown once: when it has gone its actions let go of their handlers.
class AlertController : public ViewController {
public:
    static std::shared_ptr<AlertController> create(std::string_view title, std::string_view message,
                                                   AlertStyle style);
    ~AlertController() override;

    AlertStyle style() const;
    const std::string& alertTitle() const;
    const std::string& message() const;
    void addAction(AlertAction::Pointer action);
    const std::vector<AlertAction::Pointer>& actions() const;
    void addTextField(const std::function<void(TextField&)>& configure);
    const std::vector<std::shared_ptr<TextField>>& textFields() const;
    /// The area between the message or text field and the actions.
    std::shared_ptr<ViewController> contentViewController() const;
    void setContentViewController(std::shared_ptr<ViewController> content);

    /// Points the sheet at a rectangle of a view (its coordinates).
    void setPopoverAnchor(const std::shared_ptr<View>& view, Rect rect,
                          ArrowDirection directions = ArrowDirection::any);
    void setPopoverAnchor(const BarButtonItem::Pointer& item);

    /// What choosing the action does: asks it, dismisses, and runs its handler when the alert has
    /// gone (at once where nothing moves).
    void choose(const AlertAction::Pointer& action);

    bool performKeyCommand(KeyCommand command) override;
    void loadView() override;
    void viewDidLayoutSubviews() override;
    void viewDidDisappear(bool animated) override;

    struct Content;

private:
    AlertController(std::string_view title, std::string_view message, AlertStyle style);
    std::unique_ptr<Content> content_;
};

} // namespace platform
