#include "platform/system/HostRoute.h"

#include "platform/files/FileDescriptor.h"

#include <algorithm>
#include <array>
#include <cstring>
#include <memory>
#include <netdb.h>
#include <sys/socket.h>

namespace platform {
namespace {

/// Any will do: connecting a datagram socket only looks the route up.
constexpr const char* somePort = "443";

struct AddressListDeleter {
    void operator()(addrinfo* list) const { ::freeaddrinfo(list); }
};

bool isLoopback(const sockaddr_storage& address) {
    if (address.ss_family == AF_INET) {
        const auto& v4 = reinterpret_cast<const sockaddr_in&>(address);
        return (ntohl(v4.sin_addr.s_addr) >> 24U) == 127U;
    }
    const auto& v6 = reinterpret_cast<const sockaddr_in6&>(address);
    return IN6_IS_ADDR_LOOPBACK(&v6.sin6_addr) != 0;
}

/// Host and port of the near end of a socket.
std::string nearEnd(int socket) {
    sockaddr_storage own{};
    socklen_t length = sizeof own;
    std::array<char, NI_MAXHOST> text{};
    if (::getsockname(socket, reinterpret_cast<sockaddr*>(&own), &length) != 0 ||
        ::getnameinfo(reinterpret_cast<const sockaddr*>(&own), length, text.data(), text.size(),
                      nullptr, 0, NI_NUMERICHOST) != 0)
        return "?";
    return text.data();
}

} // namespace

HostRoute::State HostRoute::look() {
    bool local = false;
    std::string found = way(local);
    // Another way may mean another network, with other names; an unknown name may be known by now.
    if (addresses_.empty() || found.empty() || found != way_) {
        if (!resolve()) {
            way_.clear();
            return State::unresolved;
        }
        found = way(local);
    }
    way_ = std::move(found);
    if (way_.empty())
        return State::none;
    return local ? State::local : State::there;
}

bool HostRoute::resolve() {
    addrinfo wanted{};
    wanted.ai_socktype = SOCK_DGRAM;
    addrinfo* list = nullptr;
    addresses_.clear();
    if (::getaddrinfo(host_.c_str(), somePort, &wanted, &list) != 0)
        return false;
    const std::unique_ptr<addrinfo, AddressListDeleter> owner(list);
    for (const addrinfo* each = list; each; each = each->ai_next) {
        if ((each->ai_family != AF_INET && each->ai_family != AF_INET6) ||
            each->ai_addrlen > sizeof(sockaddr_storage))
            continue;
        Address address;
        std::memcpy(&address.bytes, each->ai_addr, each->ai_addrlen);
        address.length = each->ai_addrlen;
        addresses_.push_back(address);
    }
    return !addresses_.empty();
}

std::string HostRoute::way(bool& local) const {
    std::string out;
    local = true;
    for (const Address& address : addresses_) {
        const FileDescriptor socket(
            ::socket(address.bytes.ss_family, SOCK_DGRAM | SOCK_CLOEXEC | SOCK_NONBLOCK, 0));
        if (!socket || ::connect(socket.get(), reinterpret_cast<const sockaddr*>(&address.bytes),
                                 address.length) != 0)
            continue;
        out += nearEnd(socket.get()) + ' ';
        local = local && isLoopback(address.bytes);
    }
    return out;
}

} // namespace platform
