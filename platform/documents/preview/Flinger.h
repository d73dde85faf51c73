#pragma once

#include "platform/documents/list/DragSpeed.h"
#include "platform/ui/Animation.h"

#include <functional>

namespace platform {

/// The way that goes on when a drag was let go: slowing down, on the platform's clock.
class Flinger {
public:
    /// Takes the next stretch of the way; answers false when there is no more room.
    using Step = std::function<bool(Point stretch)>;

    explicit Flinger(Step step) : step_(std::move(step)) {}

    /// A finger is at that place.
    void track(Point point) { drag_.track(point); }
    void forget() { drag_.forget(); }
    /// The finger was lifted: goes on with the speed of the last moments.
    void release();
    void stop() { motion_.stop(); }
    bool isMoving() const { return motion_.isRunning(); }

private:
    Step step_;
    DragSpeed drag_;
    Animation motion_;
};

} // namespace platform
