#pragma once

#include "platform/base/Clock.h"
#include "platform/ui/Geometry.h"

#include <vector>

namespace platform {

/// How fast a finger moves: over the last moments of a drag, by the platform's clock.
class DragSpeed {
public:
    void track(Point point);
    void forget() { samples_.clear(); }
    /// Points a second, to the right and downward.
    Point speed() const;

private:
    struct Sample {
        Duration time;
        Point point;
    };
    std::vector<Sample> samples_;
};

} // namespace platform
