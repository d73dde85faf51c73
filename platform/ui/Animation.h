#pragma once

#include "platform/base/Clock.h"

#include <functional>
#include <memory>

namespace platform {

/// How progress follows time.
enum class AnimationCurve { linear, easeOut };

/// One change on screen that takes time: 60 steps a second of the platform's clock, on the main
/// queue. Where motion is reduced it is over at once. Going away stops it silently. Main thread.
class Animation {
public:
    /// Takes the eased progress, 0 at the start and 1 at the end.
    using Step = std::function<void(double progress)>;

    Animation();
    ~Animation();
    Animation(const Animation&) = delete;
    Animation& operator=(const Animation&) = delete;

    /// Takes the first step before it returns. A running change is stopped first.
    void start(Duration duration, AnimationCurve curve, Step step, Job completion = {});
    /// Jumps to the end: the last step and the completion run before this returns.
    void finish();
    /// Leaves things as they are; the completion never runs.
    void stop();
    bool isRunning() const;

private:
    struct State;
    std::shared_ptr<State> state_;
};

} // namespace platform
