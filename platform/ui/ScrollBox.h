#pragma once

#include "platform/ui/View.h"

#include <memory>

namespace platform {

/// Shows a part of a content that may be taller than itself: moved by the wheel, by dragging, by
/// the arrow and page keys, and so that the control with the focus is always in sight.
class ScrollBox : public View {
public:
    explicit ScrollBox(std::shared_ptr<View> content);
    ~ScrollBox() override;

    /// The content fills the width and has this height.
    void setContentHeight(double height);
    double offset() const;
    void scrollTo(double offset);

protected:
    void layoutSubviews() override;

private:
    struct Scrolling;
    Scrolling& scrolling() const;
};

} // namespace platform
