#pragma once

#include "platform/base/TimerSource.h"
#include "platform/ui/Controls.h"
#include "platform/ui/Window.h"

#include <memory>

namespace platform {

/// The strip at the top of a window: the account at its leading end, the network and, while
/// something uses it, a turning sign at its trailing end.
class StatusStrip : public View {
public:
    StatusStrip();
    ~StatusStrip() override;

    void setContent(const StatusStripContent& content);
    const StatusStripContent& content() const { return content_; }
    void setTapped(std::function<void()> tapped);
    /// The height that its text needs, at least the theme's.
    static double height();

protected:
    void layoutSubviews() override;

private:
    class Spinner;
    StatusStripContent content_;
    std::shared_ptr<Label> account_;
    std::shared_ptr<Label> network_;
    std::shared_ptr<Spinner> spinner_;
};

} // namespace platform
