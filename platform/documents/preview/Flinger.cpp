#include "platform/documents/preview/Flinger.h"

#include "platform/documents/list/Motion.h"
#include "platform/ui/Application.h"

#include <cmath>
#include <memory>

namespace platform {

void Flinger::release() {
    const Point start = drag_.speed();
    drag_.forget();
    const double fast = std::hypot(start.x, start.y);
    if (fast < motion::slowestFling || Application::shared().reducesMotion())
        return;
    const double seconds = motion::flingSeconds(fast);
    const auto covered = std::make_shared<double>(0);
    motion_.start(motion::duration(seconds), AnimationCurve::linear,
                  [this, start, seconds, covered](double progress) {
                      const double share = motion::flingShare(progress * seconds);
                      const double stretch = share - std::exchange(*covered, share);
                      if (stretch > 0 && !step_({start.x * stretch, start.y * stretch}))
                          motion_.stop();
                  });
}

} // namespace platform
