#include "services/NetworkIndicator.h"

#include "platform/Platform.h"
#include "platform/system/NetworkActivityIndicator.h"

namespace tavrin {

const std::shared_ptr<NetworkIndicator>& NetworkIndicator::sharedNetworkIndicator() {
    // Never destroyed: a download may hide its activity while the process ends.
    static const auto& indicator =
        *new std::shared_ptr<NetworkIndicator>(std::make_shared<NetworkIndicator>());
    return indicator;
}

void NetworkIndicator::show(const std::string& identifier) {
    const std::lock_guard lock(mutex_);
    if (ids_.insert(identifier).second && ids_.size() == 1)
        platform::Platform::current().networkActivityIndicator().setVisible(true);
}

void NetworkIndicator::hide(const std::string& identifier) {
    const std::lock_guard lock(mutex_);
    if (ids_.erase(identifier) != 0 && ids_.empty())
        platform::Platform::current().networkActivityIndicator().setVisible(false);
}

} // namespace tavrin
