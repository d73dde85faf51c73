#include "platform/documents/list/DragSpeed.h"

#include "platform/base/Runtime.h"

namespace platform {
namespace {

constexpr Duration lastMoments = std::chrono::milliseconds(100);

} // namespace

void DragSpeed::track(Point point) {
    const Duration now = Runtime::current().clock.monotonic();
    std::erase_if(samples_, [&](const Sample& each) { return now - each.time > lastMoments; });
    samples_.push_back({now, point});
}

Point DragSpeed::speed() const {
    if (samples_.size() < 2)
        return {};
    const Sample& first = samples_.front();
    const Sample& last = samples_.back();
    const double seconds = std::chrono::duration<double>(last.time - first.time).count();
    if (seconds <= 0)
        return {};
    return {(last.point.x - first.point.x) / seconds, (last.point.y - first.point.y) / seconds};
}

} // namespace platform
