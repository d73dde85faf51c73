#include "platform/files/FilesClock.h"

#include "platform/base/Runtime.h"

namespace platform {

Clock& filesClock() {
    if (Runtime::installed())
        return Runtime::current().clock;
    static Clock& machine = *makeRealClock().release(); // lives as long as the process
    return machine;
}

} // namespace platform
