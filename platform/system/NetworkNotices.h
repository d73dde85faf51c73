#pragma once

#include "platform/base/Clock.h"

#include <memory>

namespace platform {

class EventThread;

/// Hears from the kernel when addresses, routes or mounted disks may have changed. It does not say
/// what: whoever hears looks for himself. Lives on the event thread, which makes and destroys it.
class NetworkNotices {
public:
    NetworkNotices(EventThread& thread, Job touched);
    ~NetworkNotices();
    NetworkNotices(const NetworkNotices&) = delete;
    NetworkNotices& operator=(const NetworkNotices&) = delete;

private:
    struct State;
    std::unique_ptr<State> state_;
};

} // namespace platform
