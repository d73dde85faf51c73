#pragma once

#include "platform/ui/AlertController.h"
#include "platform/ui/AlertPanel.h"
#include "platform/ui/Card.h"

#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace platform {

/// What an alert asks and how it stands in the window.
struct AlertController::Content {
    /// Where the alert stands.
    enum class Form { centered, bottomSheet, popover };

    explicit Content(AlertController& theOwner) : owner(theOwner) {}

    Form form() const;
    void build();
    /// After a change of the parts, when there is something to change.
    void rebuild();
    void layout();
    void layoutCentered(Rect room);
    void layoutBottomSheet(Rect room);
    void layoutPopover(Rect room);
    std::optional<Rect> anchorInWindow() const;
    void showStep(double progress);
    void takeFocus() const;

    /// What Escape and a tap beside a sheet take: the cancel action, else the only one, else the
    /// one that says "Cancel".
    AlertAction::Pointer escapeAction() const;
    /// What Enter takes: the last ordinary action that is not the way out, else the only one.
    AlertAction::Pointer defaultAction() const;
    void escape();
    void letGoOfHandlers();

    AlertController& owner;
    std::string title;
    std::string message;
    AlertStyle style = AlertStyle::alert;
    std::vector<AlertAction::Pointer> actions;
    std::vector<std::shared_ptr<TextField>> fields;
    std::shared_ptr<ViewController> area;

    std::weak_ptr<View> anchorView;
    Rect anchorRect;
    ArrowDirection directions = ArrowDirection::any;
    std::weak_ptr<BarButtonItem> anchorItem;

    std::shared_ptr<View> dim;
    std::shared_ptr<Card> card;
    std::shared_ptr<AlertPanel> panel;
    /// The way out of a bottom sheet stands apart from the other actions, over the same shadow.
    std::shared_ptr<Card> backdrop;
    std::shared_ptr<Card> cancelCard;
    std::shared_ptr<AlertPanel> cancelPanel;
    Form builtForm = Form::centered;
    double progress = 1;
    bool chosen = false;
};

} // namespace platform
