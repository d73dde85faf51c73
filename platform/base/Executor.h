#pragma once

#include "platform/base/Clock.h"

namespace platform {

/// A place where jobs run. `async` returns at once; the job runs later, on the place's own thread.
class Executor {
public:
    virtual ~Executor() = default;
    virtual void async(Job job) = 0;
};

} // namespace platform
