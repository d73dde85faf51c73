#pragma once

#include "platform/base/WorkQueue.h"
#include "platform/system/ReachabilityService.h"

#include <atomic>
#include <cstdint>
#include <memory>
#include <string>

namespace tavrin {

enum NetworkState : std::uint32_t {
    networkUnknown = 0,
    networkNotConnected = 1,
    /// Wi-Fi, or any other way that is not cellular.
    networkWiFi = 2,
    networkCellular = 3,
};

/// The current, coarse state of the network. Nobody is told of changes: users read the state when
/// they need it, from any thread. Reports arrive on a queue of its own.
class NetworkWatcher {
public:
    NetworkWatcher();
    ~NetworkWatcher();
    NetworkWatcher(const NetworkWatcher&) = delete;
    NetworkWatcher& operator=(const NetworkWatcher&) = delete;

    static const std::shared_ptr<NetworkWatcher>& sharedNetworkWatcher();

    /// Begins watching; nothing when it already does. A failure means "not connected", and a later
    /// call tries again where no target could be made.
    void start();
    /// Detaches and forgets: the state is unknown again.
    void stop();
    std::uint32_t networkState() const { return state_.load(std::memory_order_relaxed); }
    bool isConnected() const;
    std::uint32_t reachabilityFlags() const { return flags_.load(std::memory_order_relaxed); }
    static std::string _descriptionForNetworkState(std::uint32_t state);

private:
    void _updateState(std::uint32_t state);
    void handleReport(std::uint32_t flags);

    std::shared_ptr<platform::WorkQueue> queue_;
    std::unique_ptr<platform::ReachabilityTarget> reachability_;
    std::atomic<std::uint32_t> flags_{0};
    std::atomic<std::uint32_t> state_{networkUnknown};
};

} // namespace tavrin
