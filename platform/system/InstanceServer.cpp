#include "platform/system/InstanceServer.h"

#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/system/EventThread.h"
#include "platform/system/InstanceMessage.h"
#include "platform/system/PeerProcess.h"
#include "platform/system/SystemHandles.h"

#include <array>
#include <cerrno>
#include <list>
#include <sys/epoll.h>
#include <sys/socket.h>
#include <utility>

namespace platform {
namespace {

/// More callers than that wait for their turn in the kernel.
constexpr std::size_t mostClients = 32;
/// How long nobody is let in when the process has no descriptor left.
constexpr std::uint64_t pauseMicroseconds = 1'000'000;

std::uint64_t microseconds(Duration duration) {
    return static_cast<std::uint64_t>(
        std::chrono::duration_cast<std::chrono::microseconds>(duration).count());
}

void send(int socket, std::string_view text) {
    // A caller who does not wait for the answer does without it.
    if (::send(socket, text.data(), text.size(), MSG_NOSIGNAL | MSG_DONTWAIT) < 0)
        platformLog(LogLevel::debug, "A caller did not wait for the answer");
}

} // namespace

struct InstanceServer::State {
    struct Client {
        State& server;
        FileDescriptor socket;
        PeerProcess peer;
        FrameReader reader;
        EventSource input;
        EventSource deadline;
        std::list<Client>::iterator place;
    };

    EventThread& thread;
    FileDescriptor listener;
    KnownCallers callers;
    Duration patience;
    RequestTaker take;
    EventSource arrivals;
    EventSource pause;
    std::list<Client> clients;

    void start() {
        sd_event_source* source = nullptr;
        if (sd_event_add_io(thread.loop(), &source, listener.get(), EPOLLIN, arrived, this) < 0)
            platformLog(LogLevel::error, "Requests of other starts cannot be heard");
        arrivals.reset(source);
    }

    void setArrivals(bool on) {
        if (arrivals)
            sd_event_source_set_enabled(arrivals.get(), on ? SD_EVENT_ON : SD_EVENT_OFF);
    }

    static int arrived(sd_event_source* /*source*/, int /*descriptor*/, std::uint32_t /*events*/,
                       void* self) {
        static_cast<State*>(self)->accept();
        return 0;
    }

    void accept() {
        FileDescriptor socket(
            ::accept4(listener.get(), nullptr, nullptr, SOCK_CLOEXEC | SOCK_NONBLOCK));
        if (!socket && (errno == EMFILE || errno == ENFILE || errno == ENOBUFS || errno == ENOMEM))
            return takeBreath();
        if (!socket)
            return;
        std::optional<PeerProcess> peer = PeerProcess::ofSocket(socket.get());
        if (!peer || peer->user() != ::geteuid()) {
            platformLog(LogLevel::warning, "Another user's request was not heard");
            return;
        }
        clients.push_back(
            Client{*this, std::move(socket), *std::move(peer), {}, nullptr, nullptr, {}});
        Client& client = clients.back();
        client.place = std::prev(clients.end());
        if (!listenTo(client))
            clients.pop_back();
        setArrivals(clients.size() < mostClients);
    }

    bool listenTo(Client& client) const {
        sd_event_source* input = nullptr;
        sd_event_source* deadline = nullptr;
        if (sd_event_add_io(thread.loop(), &input, client.socket.get(), EPOLLIN, spoke, &client) <
            0)
            return false;
        client.input.reset(input);
        if (sd_event_add_time_relative(thread.loop(), &deadline, CLOCK_MONOTONIC,
                                       microseconds(patience), 0, late, &client) < 0)
            return false;
        client.deadline.reset(deadline);
        return true;
    }

    void takeBreath() {
        sd_event_source* timer = nullptr;
        setArrivals(false);
        sd_event_add_time_relative(thread.loop(), &timer, CLOCK_MONOTONIC, pauseMicroseconds, 0,
                                   breathed, this);
        pause.reset(timer);
    }

    static int breathed(sd_event_source* /*source*/, std::uint64_t /*time*/, void* self) {
        auto& state = *static_cast<State*>(self);
        state.setArrivals(state.clients.size() < mostClients);
        return 0;
    }

    static int late(sd_event_source* /*source*/, std::uint64_t /*time*/, void* client) {
        auto& self = *static_cast<Client*>(client);
        platformLog(LogLevel::warning, "A caller (process %@) did not finish its request in time",
                    std::to_string(self.peer.pid()));
        self.server.end(self);
        return 0;
    }

    static int spoke(sd_event_source* /*source*/, int /*descriptor*/, std::uint32_t /*events*/,
                     void* client) {
        auto& self = *static_cast<Client*>(client);
        self.server.read(self);
        return 0;
    }

    void read(Client& client) {
        std::array<char, 64 * 1024> buffer; // NOLINT: recv() fills it
        const ssize_t got = ::recv(client.socket.get(), buffer.data(), buffer.size(), 0);
        if (got < 0 && (errno == EAGAIN || errno == EINTR))
            return;
        if (got <= 0)
            return end(client);
        switch (client.reader.take({buffer.data(), static_cast<std::size_t>(got)})) {
        case FrameReader::State::wantsMore:
            return;
        case FrameReader::State::broken:
            platformLog(LogLevel::warning, "A caller (%@) sent something that is no request",
                        identityOf(client.peer, callers));
            send(client.socket.get(),
                 localized("The request is damaged and was not taken.") + '\n');
            return end(client);
        case FrameReader::State::complete:
            answer(client);
            return end(client);
        }
    }

    /// While the caller waits for its answer it is alive, and can be told who it is.
    void answer(const Client& client) const {
        OpenRequest request = client.reader.request();
        Failure failure = checkRequestLimits(request);
        request.source = identityOf(client.peer, callers);
        if (!failure)
            failure = take(std::move(request));
        send(client.socket.get(), failure ? failure->localizedDescription.value_or("") + '\n'
                                          : std::string(acceptedAnswer));
    }

    void end(Client& client) {
        clients.erase(client.place);
        setArrivals(true);
    }
};

InstanceServer::InstanceServer(EventThread& thread, FileDescriptor listener, KnownCallers callers,
                               Duration patience, RequestTaker take)
    : state_(new State{thread,
                       std::move(listener),
                       std::move(callers),
                       patience,
                       std::move(take),
                       nullptr,
                       nullptr,
                       {}}) {
    state_->start();
}

InstanceServer::~InstanceServer() = default;

} // namespace platform
