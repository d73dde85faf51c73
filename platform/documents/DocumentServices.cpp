#include "platform/documents/DocumentServices.h"

#include "platform/Platform.h"

namespace platform {

DocumentServices DocumentServices::current() {
    Platform& platform = Platform::current();
    return {platform.mainQueue(),   platform.notifications(), platform.documents(),
            platform.accounts(),    platform.cloud(),         platform.directoryWatcher(),
            platform.fileProgress()};
}

} // namespace platform
