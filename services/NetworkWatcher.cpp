#include "services/NetworkWatcher.h"

#include "app/VXLogging.h"
#include "platform/Platform.h"
#include "platform/base/Identity.h"

namespace tavrin {
namespace {

/// A public host that is always there; accounts on a server of their own are watched by the service
/// behind this name.
constexpr const char* watchedHost = "www.pelmora.com";

} // namespace

NetworkWatcher::NetworkWatcher()
    : queue_(std::make_shared<platform::WorkQueue>(std::string(platform::applicationIdentifier) +
                                                   ".networkwatcher")) {
}

NetworkWatcher::~NetworkWatcher() {
    stop();
}

const std::shared_ptr<NetworkWatcher>& NetworkWatcher::sharedNetworkWatcher() {
    // Never destroyed: what it detaches from may be gone by the end of the process.
    static const auto& watcher =
        *new std::shared_ptr<NetworkWatcher>(std::make_shared<NetworkWatcher>());
    return watcher;
}

void NetworkWatcher::start() {
    if (reachability_)
        return;
    reachability_ = platform::Platform::current().reachability().createTarget(watchedHost);
    if (!reachability_) {
        VXLOG(vxError, "Couldn't create reachability object");
        flags_ = 0;
        _updateState(networkNotConnected);
        return;
    }
    const bool attached = reachability_->setCallback([this](std::uint32_t flags) {
        handleReport(flags);
    }) && reachability_->setQueue(queue_);
    if (!attached) {
        VXLOG(vxError, "Couldn't set reachability callback or queue");
        flags_ = 0;
        _updateState(networkNotConnected);
    }
}

void NetworkWatcher::stop() {
    if (!reachability_)
        return;
    reachability_->setCallback({});
    reachability_->setQueue(nullptr);
    reachability_.reset();
    flags_ = 0;
    state_ = networkUnknown;
}

bool NetworkWatcher::isConnected() const {
    const std::uint32_t state = networkState();
    return state == networkWiFi || state == networkCellular;
}

void NetworkWatcher::handleReport(std::uint32_t flags) {
    VXLOG(vxInfo, "Network reachability flags changed to 0x%x", flags);
    flags_ = flags;
    if ((flags & platform::reachabilityReachable) == 0)
        _updateState(networkNotConnected);
    else
        _updateState((flags & platform::reachabilityCellular) != 0 ? networkCellular : networkWiFi);
}

void NetworkWatcher::_updateState(std::uint32_t state) {
    if (state == networkState())
        return;
    VXLOG(vxInfo, "Network state changed to %@", _descriptionForNetworkState(state));
    state_ = state;
}

std::string NetworkWatcher::_descriptionForNetworkState(std::uint32_t state) {
    switch (state) {
    case networkUnknown:
        return "unknown";
    case networkNotConnected:
        return "not connected";
    case networkWiFi:
        return "connected to Wi-Fi";
    case networkCellular:
        return "connected to cellular";
    default:
        return platform::format("??? (%lu)", state);
    }
}

} // namespace tavrin
