#pragma once

#include "platform/base/Date.h"
#include "platform/base/TimerSource.h"
#include "platform/ui/ShapeLayer.h"
#include "platform/ui/View.h"

#include <functional>
#include <memory>
#include <utility>

namespace tavrin {

/// A progress pie whose wedge does not jump to each value: a 60-per-second timer grows it, at a
/// rate re-estimated from the speed of the real progress, and never past the real value. Main
/// thread.
class RoundProgressView : public platform::View {
public:
    /// 0: white with a dark shadow; 1: light grey at half opacity.
    explicit RoundProgressView(platform::Rect frame, int style = 0);
    ~RoundProgressView() override;

    int style() const { return style_; }
    float progress() const { return progress_; }
    /// A real progress value, from 0 to 1. One that does not advance is kept but moves nothing.
    void setProgress(float progress);
    /// An empty wedge; the timer stops.
    void resetProgress();
    /// Called before each step of the animation: what changes then is painted together with it.
    void setStepHandler(std::function<void()> step) { step_ = std::move(step); }
    void startProgressTimer();
    void stopProgressTimer();
    /// The growth a step, while no timer runs.
    void setInitialIncreaseRatePerFrame(float rate);
    void setPieCenter(platform::Point center);
    void setPieRadius(float radius);

    /// What the wedge shows now.
    float uiProgress() const { return uiProgress_; }
    float realProgress() const { return realProgress_; }
    float increaseRate() const { return increaseRate_; }
    bool isAnimating() const { return progressTimer_ != nullptr; }
    platform::Point pieCenter() const { return pieCenter_; }
    float pieRadius() const { return pieRadius_; }
    const std::shared_ptr<platform::ShapeLayer>& sliceLayer() const { return sliceLayer_; }
    const std::shared_ptr<platform::ShapeLayer>& circleLayer() const { return circleLayer_; }

private:
    void _setupSubviews();
    void increaseUIProgress();
    void drawSlice();
    static float toRadian(float progress);
    void recalculateIncreaseProgress(float remaining, double withTimeDiff);

    int style_;
    float progress_ = 0;
    std::shared_ptr<platform::ShapeLayer> sliceLayer_;
    std::shared_ptr<platform::ShapeLayer> circleLayer_;
    std::shared_ptr<platform::View> carrier_;
    platform::Point pieCenter_;
    float pieRadius_ = 0;
    std::unique_ptr<platform::TimerSource> progressTimer_;
    float uiProgress_ = 0;
    float realProgress_ = 0;
    float increaseRate_ = 0;
    platform::Date prevUpdateTime_;
    std::function<void()> step_;
};

} // namespace tavrin
