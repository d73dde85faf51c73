#pragma once

#include <netinet/in.h>
#include <string>
#include <vector>

namespace platform {

/// Asks the kernel for the way to one host, without sending anything to it. Not thread-safe.
class HostRoute {
public:
    enum class State {
        /// Nobody knows the name, or nobody who knows it can be asked.
        unresolved,
        none,
        there,
        /// The host is this machine.
        local
    };

    explicit HostRoute(std::string host) : host_(std::move(host)) {}
    const std::string& host() const { return host_; }
    /// Blocks while the name is looked up, which is done only when the way has changed.
    State look();

private:
    struct Address {
        sockaddr_storage bytes{};
        socklen_t length = 0;
    };
    bool resolve();
    /// The way to the known addresses, as one text to compare; "" when there is none.
    std::string way(bool& local) const;

    std::string host_;
    std::vector<Address> addresses_;
    std::string way_;
};

} // namespace platform
