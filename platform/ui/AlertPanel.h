#pragma once

#include "platform/ui/AlertController.h"
#include "platform/ui/ScrollBox.h"

#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace platform {

/// What a panel holds, from top to bottom.
struct AlertPanelParts {
    std::string title;
    std::string message;
    std::vector<std::shared_ptr<TextField>> fields;
    /// The view of the alert's content area.
    std::shared_ptr<View> area;
    std::vector<AlertAction::Pointer> actions;
    AlertAction::Pointer defaultAction;
    AlertAction::Pointer escapeAction;
    /// Actions of a sheet stand below each other, its words are smaller.
    bool isSheet = false;
};

/// The words, fields and actions of an alert on their card; scrolls when the window is too low.
class AlertPanel : public View {
public:
    using Choose = std::function<void(const AlertAction::Pointer&)>;

    /// `resized` is called when the parts need another height than heightForWidth answered.
    AlertPanel(const AlertPanelParts& parts, const Choose& choose, std::function<void()> resized);
    ~AlertPanel() override;

    /// The height that the parts need at that width. Lays them out for it.
    double heightForWidth(double width);
    void focusAction(const AlertAction::Pointer& action) const;

protected:
    void layoutSubviews() override;

private:
    class Body;
    std::shared_ptr<Body> body_;
    std::shared_ptr<ScrollBox> scroll_;
};

} // namespace platform
