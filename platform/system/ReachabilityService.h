#pragma once

#include "platform/base/WorkQueue.h"

#include <cstdint>
#include <functional>
#include <memory>
#include <string>

namespace platform {

/// Bits of a reachability report.
enum ReachabilityFlag : std::uint32_t {
    /// The host can be reached.
    reachabilityReachable = 0x2,
    /// A connection must be set up first.
    reachabilityConnectionRequired = 0x4,
    /// The way to the host is a cellular (or otherwise metered) network.
    reachabilityCellular = 0x40000,
};

/// Watches whether one host can be reached. Reports come for the first state and for each change.
class ReachabilityTarget {
public:
    using Callback = std::function<void(std::uint32_t flags)>;
    virtual ~ReachabilityTarget() = default;
    /// An empty callback detaches. False when the service refuses.
    virtual bool setCallback(Callback callback) = 0;
    /// The serial queue on which reports arrive; none detaches and stops reports.
    virtual bool setQueue(std::shared_ptr<WorkQueue> queue) = 0;
};

class ReachabilityService {
public:
    virtual ~ReachabilityService() = default;
    /// None when no target can be made.
    virtual std::unique_ptr<ReachabilityTarget> createTarget(const std::string& host) = 0;
};

} // namespace platform
