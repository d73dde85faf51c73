#pragma once

#include <memory>
#include <mutex>
#include <set>
#include <string>

namespace tavrin {

/// Keeps the network-activity indicator on while any named activity runs. Safe from any thread.
class NetworkIndicator {
public:
    static const std::shared_ptr<NetworkIndicator>& sharedNetworkIndicator();

    /// An identifier that is shown already changes nothing.
    void show(const std::string& identifier);
    /// An identifier that is not shown changes nothing.
    void hide(const std::string& identifier);

private:
    std::mutex mutex_; // held while the set and the indicator change together
    std::set<std::string> ids_;
};

} // namespace tavrin
