#include "platform/system/NetworkNotices.h"

#include "platform/base/Error.h"
#include "platform/base/Log.h"
#include "platform/files/FileDescriptor.h"
#include "platform/system/EventThread.h"
#include "platform/system/SystemHandles.h"

#include <array>
#include <cerrno>
#include <fcntl.h>
#include <linux/netlink.h>
#include <linux/rtnetlink.h>
#include <sys/epoll.h>
#include <sys/socket.h>

namespace platform {

struct NetworkNotices::State {
    Job touched;
    FileDescriptor routes;
    FileDescriptor mounts;
    EventSource routeSource;
    EventSource mountSource;

    bool openRoutes(sd_event* loop) {
        routes = FileDescriptor(
            ::socket(AF_NETLINK, SOCK_RAW | SOCK_CLOEXEC | SOCK_NONBLOCK, NETLINK_ROUTE));
        sockaddr_nl address{};
        address.nl_family = AF_NETLINK;
        address.nl_groups = RTMGRP_LINK | RTMGRP_IPV4_IFADDR | RTMGRP_IPV4_ROUTE |
                            RTMGRP_IPV6_IFADDR | RTMGRP_IPV6_ROUTE;
        if (!routes ||
            ::bind(routes.get(), reinterpret_cast<const sockaddr*>(&address), sizeof address) != 0)
            return false;
        return watch(loop, routes.get(), EPOLLIN, routesChanged, routeSource);
    }

    bool openMounts(sd_event* loop) {
        mounts = FileDescriptor(::open("/proc/self/mountinfo", O_RDONLY | O_CLOEXEC));
        // The kernel says a changed table with "priority" and "error", once for every change.
        return mounts && watch(loop, mounts.get(), EPOLLPRI, mountsChanged, mountSource);
    }

    bool watch(sd_event* loop, int descriptor, std::uint32_t events, sd_event_io_handler_t handler,
               EventSource& out) {
        sd_event_source* source = nullptr;
        if (sd_event_add_io(loop, &source, descriptor, events, handler, this) < 0)
            return false;
        out.reset(source);
        return true;
    }

    static int routesChanged(sd_event_source* /*source*/, int descriptor, std::uint32_t /*events*/,
                             void* self) {
        std::array<char, 16 * 1024> unread; // NOLINT: recv() fills it
        // ENOBUFS says that notices were lost, which is a notice as well.
        while (::recv(descriptor, unread.data(), unread.size(), 0) > 0 || errno == ENOBUFS ||
               errno == EINTR) {
        }
        static_cast<State*>(self)->touched();
        return 0;
    }

    static int mountsChanged(sd_event_source* /*source*/, int /*descriptor*/,
                             std::uint32_t /*events*/, void* self) {
        static_cast<State*>(self)->touched();
        return 0;
    }
};

NetworkNotices::NetworkNotices(EventThread& thread, Job touched)
    : state_(std::make_unique<State>()) {
    state_->touched = std::move(touched);
    if (!state_->openRoutes(thread.loop()))
        platformLog(LogLevel::warning, "Changes of the network are not noticed: %@",
                    posixError(errno, Url(), false));
    if (!state_->openMounts(thread.loop()))
        platformLog(LogLevel::warning, "Changes of mounted disks are not noticed");
}

NetworkNotices::~NetworkNotices() = default;

} // namespace platform
