#include "platform/ui/StatusStrip.h"

#include "platform/base/Runtime.h"
#include "platform/base/Text.h"
#include "platform/ui/Application.h"
#include "platform/ui/Canvas.h"
#include "platform/ui/Direction.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/ViewImpl.h"

#include <algorithm>
#include <cmath>
#include <numbers>

namespace platform {
namespace {

constexpr int spinnerSpokes = 8;
/// One spoke further, so a turn takes 0.8 s.
constexpr Duration spinnerStep = std::chrono::milliseconds(100);
constexpr double partGap = 6;

std::shared_ptr<Label> makeLabel() {
    auto label = std::make_shared<Label>();
    label->setFont(Font::preferred(TextStyle::caption));
    label->setTextColor(Theme::secondaryText);
    label->setLineBreak(LineBreak::elideMiddle);
    return label;
}

} // namespace

/// Spokes of which the darkest wanders; it stands still where motion is reduced.
class StatusStrip::Spinner : public View {
public:
    void setTurning(bool turning) {
        setHidden(!turning);
        if (!turning) {
            timer_.reset();
            return;
        }
        if (timer_ || Application::shared().reducesMotion())
            return;
        Runtime& runtime = Runtime::current();
        timer_ = std::make_unique<TimerSource>(runtime.clock, runtime.mainQueue);
        timer_->schedule(spinnerStep, spinnerStep);
        timer_->setHandler([weak = weak_from_this()] {
            if (const auto self = std::static_pointer_cast<Spinner>(weak.lock()))
                self->turn();
        });
        timer_->resume();
    }

protected:
    void draw(Canvas& canvas) override {
        const Point center = bounds().center();
        const double outer = bounds().width / 2 - 1;
        for (int i = 0; i < spinnerSpokes; ++i) {
            const double angle = 2 * std::numbers::pi * (phase_ - i) / spinnerSpokes;
            Path spoke;
            spoke.moveTo({center.x + outer * 0.45 * std::cos(angle),
                          center.y + outer * 0.45 * std::sin(angle)});
            spoke.lineTo({center.x + outer * std::cos(angle), center.y + outer * std::sin(angle)});
            const double strength = 1 - 0.85 * i / spinnerSpokes;
            canvas.stroke(spoke, Theme::secondaryText.withAlpha(strength), 1.5);
        }
    }

private:
    void turn() {
        phase_ = (phase_ + 1) % spinnerSpokes;
        setNeedsDisplay();
    }

    int phase_ = 0;
    std::unique_ptr<TimerSource> timer_;
};

StatusStrip::StatusStrip()
    : account_(makeLabel()), network_(makeLabel()), spinner_(std::make_shared<Spinner>()) {
    setBackgroundColor(Theme::bar);
    setDebugName("status strip");
    addSubview(account_);
    addSubview(network_);
    addSubview(spinner_);
    spinner_->setAccessibleName(localized("Network activity"));
    spinner_->setHidden(true);
}

StatusStrip::~StatusStrip() = default;

void StatusStrip::setContent(const StatusStripContent& content) {
    content_ = content;
    account_->setText(content.account);
    network_->setText(content.network);
    spinner_->setTurning(content.activity);
    setNeedsLayout();
}

void StatusStrip::setTapped(std::function<void()> tapped) {
    addTapHandler(std::move(tapped));
    // No stop of the Tab key: it is no part of any screen.
    if (QWidget* const widget = impl().widget)
        widget->setFocusPolicy(Qt::NoFocus);
    impl().role = QAccessible::Client;
}

double StatusStrip::height() {
    return std::max(Theme::statusStripHeight, Font::preferred(TextStyle::caption).lineHeight() + 2);
}

void StatusStrip::layoutSubviews() {
    const Rect area = bounds();
    const double margin = pageMargin();
    const double spinnerSize = std::round(Font::preferred(TextStyle::caption).pointSize());
    const double middle = std::floor((area.height - spinnerSize) / 2);
    double end = area.width - margin;
    if (content_.activity) {
        spinner_->setFrame(
            mirrored({end - spinnerSize, middle, spinnerSize, spinnerSize}, area.width));
        end -= spinnerSize + partGap;
    }
    // The network's few words stand whole; a long account gives way.
    const double wanted = network_->intrinsicContentSize().width;
    const double network = std::min(wanted, std::max(0.0, (end - margin) * 0.6));
    network_->setFrame(mirrored({end - network, 0, network, area.height}, area.width));
    if (network > 0)
        end -= network + Theme::iconGap;
    const double account =
        std::min(account_->intrinsicContentSize().width, std::max(0.0, end - margin));
    account_->setFrame(mirrored({margin, 0, account, area.height}, area.width));
}

} // namespace platform
