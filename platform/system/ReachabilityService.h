#pragma once

#include "platform/base/WorkQueue.h"

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>

namespace platform {

class Clock;

/// Bits of a reachability report.
enum ReachabilityFlag : std::uint32_t {
    /// The host can be reached.
    reachabilityReachable = 0x2,
    /// A connection must be set up first.
    reachabilityConnectionRequired = 0x4,
    /// The way to the host is a cellular (or otherwise metered) network.
    reachabilityCellular = 0x40000,
};

/// Watches whether one host can be reached. Reports come for the first state and for each change,
/// in order.
class ReachabilityTarget {
public:
    using Callback = std::function<void(std::uint32_t flags)>;
    virtual ~ReachabilityTarget() = default;
    /// An empty callback detaches: none starts after the return, and one that runs has ended
    /// (unless it is itself that detaches). False when the service refuses.
    virtual bool setCallback(Callback callback) = 0;
    /// The serial queue on which reports arrive; none detaches and stops reports, as above.
    virtual bool setQueue(std::shared_ptr<WorkQueue> queue) = 0;
};

/// Where the documents of the account come from.
struct WatchedRemote {
    /// A folder, by its path: reachable while it is there.
    std::string folder;
    /// A server's host name or address, where there is no folder.
    std::string host;
    bool operator==(const WatchedRemote&) const = default;
};

/// Knows which hosts can be reached, and how. Safe from any thread.
class ReachabilityService {
public:
    virtual ~ReachabilityService() = default;
    /// None when no target can be made.
    virtual std::unique_ptr<ReachabilityTarget> createTarget(const std::string& host) = 0;
    /// While somebody is signed in every target watches that account's remote, whatever host it was
    /// made for: the host stands for "our documents", and these may lie on a server of one's own.
    virtual void setWatchedRemote(const std::optional<WatchedRemote>& /*remote*/) {}
};

/// What the machine's network is: routes, the folder of a folder account, and where NetworkManager
/// runs whether the connection is a mobile or a metered one. The clock outlives it.
std::unique_ptr<ReachabilityService> makeLiveReachability(Clock& clock);
/// A network that is played: "wifi", "cellular", "offline", or "file:" and the path of a file that
/// holds one of these and is looked at again whenever it changes (unreadable means "offline"). None
/// when `script` is none of these.
std::unique_ptr<ReachabilityService> makeScriptedReachability(const std::string& script);
/// As PELMORA_NETWORK asks for (a script, or "live"); live without it.
std::unique_ptr<ReachabilityService>
makeReachability(Clock& clock, const std::optional<std::string>& pelmoraNetwork);

} // namespace platform
