#include "preview/RoundProgressView.h"

#include "platform/Platform.h"

#include <algorithm>
#include <chrono>
#include <numbers>
#include <optional>

namespace tavrin {
namespace {

using platform::Color;

constexpr platform::Duration animationStep{16'666'667}; // 1/60 s
constexpr float firstRate = 0.0016666667F;              // 1/600: a quarter in 2.5 s
constexpr float slowestRate = 0.00016666666F;           // 1/6000
constexpr double stepsASecond = 60;
constexpr float longestFill = 0.3F; // seconds
constexpr double finishingFill = 0.1;
/// How far the wedge creeps before there is any real progress.
constexpr float creepLimit = 0.25F;
constexpr double thinLine = 2;
constexpr double thickLine = 4;
constexpr double thickFrom = 40; // points of width
constexpr double topAngle = 3 * std::numbers::pi / 2;

struct PieLook {
    std::optional<Color> color;
    double opacity = 1;
};

PieLook lookOf(int style) {
    switch (style) {
    case 0:
        return {Color::white, 1};
    case 1:
        return {Color::gray(2.0 / 3), 0.5};
    default:
        return {};
    }
}

platform::Date now() {
    return platform::Platform::current().clock().now();
}

} // namespace

RoundProgressView::RoundProgressView(platform::Rect frame, int style) : View(frame), style_(style) {
    setBackgroundColor(Color::clear);
    _setupSubviews();
}

RoundProgressView::~RoundProgressView() = default;

void RoundProgressView::_setupSubviews() {
    const platform::Rect area = bounds();
    const double line = area.width >= thickFrom ? thickLine : thinLine;
    const PieLook look = lookOf(style_);
    carrier_ = std::make_shared<platform::View>(platform::Rect{0, 0, area.width, area.height});
    carrier_->setAlpha(look.opacity);
    addSubview(carrier_);
    const double half = std::min(area.width, area.height) / 2;
    setPieRadius(static_cast<float>(style_ == 0 ? half - line / 2 : half));
    setPieCenter({area.width / 2, area.height / 2});

    circleLayer_ = std::make_shared<platform::ShapeLayer>();
    circleLayer_->setStrokeColor(look.color);
    circleLayer_->setLineWidth(line);
    platform::Path ring;
    ring.addArc(pieCenter_, pieRadius_ - 1, 0, 2 * std::numbers::pi, true);
    circleLayer_->setPath(ring);
    sliceLayer_ = std::make_shared<platform::ShapeLayer>();
    sliceLayer_->setFillColor(look.color);
    resetProgress();
    carrier_->addLayer(circleLayer_);
    carrier_->addLayer(sliceLayer_);
    if (style_ == 0)
        carrier_->setLayerShadow({Color::black.withAlpha(0.75), {0, 0}, 1.0, 0.5});
}

void RoundProgressView::setPieRadius(float radius) {
    pieRadius_ = radius;
    const double side = 2.0 * radius;
    setFrame({pieCenter_.x - radius, pieCenter_.y - radius, side, side});
    carrier_->setFrame({0, 0, side, side});
    pieCenter_ = {radius, radius};
    setCornerRadius(radius);
}

void RoundProgressView::setPieCenter(platform::Point center) {
    const platform::Size size = frame().size();
    setFrame({center.x - size.width / 2, center.y - size.height / 2, size.width, size.height});
    pieCenter_ = {size.width / 2, size.height / 2};
}

void RoundProgressView::resetProgress() {
    uiProgress_ = 0;
    realProgress_ = 0;
    increaseRate_ = firstRate;
    prevUpdateTime_ = now();
    stopProgressTimer();
    drawSlice();
}

void RoundProgressView::startProgressTimer() {
    if (uiProgress_ >= 1.0F || progressTimer_)
        return;
    platform::Runtime& runtime = platform::Platform::current().runtime();
    progressTimer_ = std::make_unique<platform::TimerSource>(runtime.clock, runtime.mainQueue);
    progressTimer_->schedule(animationStep, animationStep);
    progressTimer_->setHandler([weak = weak_from_this()] {
        const auto self = std::static_pointer_cast<RoundProgressView>(weak.lock());
        if (!self)
            return;
        if (self->step_)
            self->step_();
        self->increaseUIProgress();
    });
    progressTimer_->resume();
}

void RoundProgressView::stopProgressTimer() {
    progressTimer_.reset();
}

void RoundProgressView::setInitialIncreaseRatePerFrame(float rate) {
    if (!progressTimer_)
        increaseRate_ = rate;
}

void RoundProgressView::setProgress(float progress) {
    progress_ = progress;
    if (!progressTimer_ && realProgress_ <= 1.0F)
        startProgressTimer();
    if (!(progress > 0 && realProgress_ < 1.0F && realProgress_ < progress))
        return;
    const float remaining = 1 - uiProgress_;
    if (progress < 1.0F) {
        const platform::Date moment = now();
        const double elapsed = moment.secondsSince(prevUpdateTime_);
        prevUpdateTime_ = moment;
        const double needed = elapsed * (1.0 - uiProgress_) / (progress - realProgress_);
        const float seconds = std::min(static_cast<float>(needed), longestFill);
        recalculateIncreaseProgress(remaining, seconds);
    } else {
        recalculateIncreaseProgress(remaining, finishingFill);
    }
    realProgress_ = progress;
}

void RoundProgressView::recalculateIncreaseProgress(float remaining, double withTimeDiff) {
    const double rate = remaining / withTimeDiff / stepsASecond;
    increaseRate_ = std::max(static_cast<float>(rate), slowestRate);
}

void RoundProgressView::increaseUIProgress() {
    const bool waiting = realProgress_ != 0 && uiProgress_ >= realProgress_;
    if (!waiting) {
        if (realProgress_ < 1.0F) {
            const bool nearEnd = !(uiProgress_ + 1.1 * increaseRate_ < 1.0);
            if (nearEnd || (realProgress_ == 0 && uiProgress_ >= creepLimit)) {
                stopProgressTimer();
                return;
            }
            uiProgress_ += increaseRate_;
        } else {
            uiProgress_ = std::min(uiProgress_ + increaseRate_, 1.0F);
        }
        drawSlice();
    }
    if (uiProgress_ >= 1.0F)
        stopProgressTimer();
}

float RoundProgressView::toRadian(float progress) {
    return static_cast<float>(2 * progress * std::numbers::pi);
}

void RoundProgressView::drawSlice() {
    platform::Path wedge;
    wedge.moveTo(pieCenter_);
    wedge.addArc(pieCenter_, pieRadius_, topAngle, topAngle + toRadian(uiProgress_), true);
    wedge.close();
    sliceLayer_->setPath(wedge);
}

} // namespace tavrin
