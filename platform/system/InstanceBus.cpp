#include "platform/system/InstanceBus.h"

#include "platform/base/Identity.h"
#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/system/BusConnection.h"
#include "platform/system/EventThread.h"
#include "platform/system/InstanceMessage.h"
#include "platform/system/PeerProcess.h"

#include <cerrno>
#include <cstring>
#include <fcntl.h>
#include <list>
#include <utility>

namespace platform {
namespace {

constexpr const char* busName = "org.freedesktop.DBus";
constexpr const char* busPath = "/org/freedesktop/DBus";
constexpr const char* tokenKey = "activation-token";
constexpr const char* startupKey = "desktop-startup-id";

/// The activation token out of the dictionary that the message stands at.
bool readToken(sd_bus_message* message, std::string& token) {
    if (sd_bus_message_enter_container(message, 'a', "{sv}") < 0)
        return false;
    while (sd_bus_message_enter_container(message, 'e', "sv") > 0) {
        const char* key = nullptr;
        const char* value = nullptr;
        if (sd_bus_message_read(message, "s", &key) <= 0)
            return false;
        const bool isToken = std::strcmp(key, tokenKey) == 0;
        if (isToken || (token.empty() && std::strcmp(key, startupKey) == 0)) {
            if (sd_bus_message_read(message, "v", "s", &value) <= 0)
                return false;
            token = value;
        } else if (sd_bus_message_skip(message, "v") < 0) {
            return false;
        }
        sd_bus_message_exit_container(message);
    }
    return sd_bus_message_exit_container(message) >= 0;
}

bool readUrls(sd_bus_message* message, std::vector<std::string>& urls) {
    if (sd_bus_message_enter_container(message, 'a', "s") < 0)
        return false;
    const char* url = nullptr;
    while (sd_bus_message_read(message, "s", &url) > 0)
        if (urls.size() <= mostRequestUrls) // one too many is enough to be refused
            urls.emplace_back(url);
    return sd_bus_message_exit_container(message) >= 0;
}

/// The process behind a connection, out of the bus's answer.
std::optional<PeerProcess> readPeer(sd_bus_message* message) {
    std::uint32_t pid = 0;
    std::uint32_t user = UINT32_MAX;
    FileDescriptor handle;
    if (sd_bus_message_enter_container(message, 'a', "{sv}") <= 0)
        return std::nullopt;
    while (sd_bus_message_enter_container(message, 'e', "sv") > 0) {
        const char* key = nullptr;
        int number = -1;
        if (sd_bus_message_read(message, "s", &key) <= 0)
            return std::nullopt;
        int result = 0;
        if (std::strcmp(key, "ProcessID") == 0)
            result = sd_bus_message_read(message, "v", "u", &pid);
        else if (std::strcmp(key, "UnixUserID") == 0)
            result = sd_bus_message_read(message, "v", "u", &user);
        else if (std::strcmp(key, "ProcessFD") == 0 &&
                 (result = sd_bus_message_read(message, "v", "h", &number)) > 0)
            handle = FileDescriptor(::fcntl(number, F_DUPFD_CLOEXEC, 3));
        else
            result = sd_bus_message_skip(message, "v");
        if (result < 0)
            return std::nullopt;
        sd_bus_message_exit_container(message);
    }
    return PeerProcess(static_cast<pid_t>(pid), user, std::move(handle));
}

} // namespace

struct InstanceBus::State {
    /// A request whose caller is being asked for at the bus.
    struct Pending {
        State& state;
        BusMessage call;
        OpenRequest request;
        BusSlot question;
        std::list<Pending>::iterator place;
    };

    KnownCallers callers;
    RequestTaker take;
    Bus bus;
    BusSlot object;
    Standing standing = Standing::away;
    std::list<Pending> pending;

    void start(EventThread& thread, const SingleInstance::Options& options) {
        bus = connectToBus(options.busAddress, options.patience);
        sd_bus_slot* slot = nullptr;
        const std::string path = busPathOf(applicationIdentifier);
        if (!bus || sd_bus_add_object_vtable(bus.get(), &slot, path.c_str(), applicationInterface,
                                             methods(), this) < 0)
            return;
        object.reset(slot);
        const int result =
            sd_bus_request_name(bus.get(), std::string(applicationIdentifier).c_str(), 0);
        if (result == -EEXIST)
            standing = Standing::taken;
        else if (result >= 0 &&
                 sd_bus_attach_event(bus.get(), thread.loop(), SD_EVENT_PRIORITY_NORMAL) >= 0)
            standing = Standing::owner;
        else
            platformLog(LogLevel::warning, "The session bus is of no use: %@",
                        std::strerror(-result)); // NOLINT(concurrency-mt-unsafe)
    }

    static const sd_bus_vtable* methods() {
        static const sd_bus_vtable table[] = {
            SD_BUS_VTABLE_START(0),
            SD_BUS_METHOD("Activate", "a{sv}", "", activate, SD_BUS_VTABLE_UNPRIVILEGED),
            SD_BUS_METHOD("Open", "asa{sv}", "", open, SD_BUS_VTABLE_UNPRIVILEGED),
            SD_BUS_METHOD("ActivateAction", "sava{sv}", "", activateAction,
                          SD_BUS_VTABLE_UNPRIVILEGED),
            SD_BUS_VTABLE_END};
        return table;
    }

    static int activate(sd_bus_message* call, void* self, sd_bus_error* error) {
        OpenRequest request;
        if (!readToken(call, request.activationToken))
            return sd_bus_error_set(error, SD_BUS_ERROR_INVALID_ARGS, "What is asked is unclear");
        return static_cast<State*>(self)->receive(call, std::move(request), error);
    }

    static int open(sd_bus_message* call, void* self, sd_bus_error* error) {
        OpenRequest request;
        if (!readUrls(call, request.urls) || !readToken(call, request.activationToken))
            return sd_bus_error_set(error, SD_BUS_ERROR_INVALID_ARGS, "What is asked is unclear");
        return static_cast<State*>(self)->receive(call, std::move(request), error);
    }

    static int activateAction(sd_bus_message* /*call*/, void* /*self*/, sd_bus_error* error) {
        return sd_bus_error_set(error, SD_BUS_ERROR_INVALID_ARGS,
                                "The application offers no actions");
    }

    /// The caller is known, and answered, only when the bus has said who it is.
    int receive(sd_bus_message* call, OpenRequest request, sd_bus_error* error) {
        if (const Failure failure = checkRequestLimits(request))
            return sd_bus_error_set(error, SD_BUS_ERROR_LIMITS_EXCEEDED,
                                    failure->localizedDescription.value_or("").c_str());
        pending.push_back(
            {*this, BusMessage(sd_bus_message_ref(call)), std::move(request), nullptr, {}});
        Pending& waiting = pending.back();
        waiting.place = std::prev(pending.end());
        sd_bus_slot* slot = nullptr;
        const int result = sd_bus_call_method_async(bus.get(), &slot, busName, busPath, busName,
                                                    "GetConnectionCredentials", identified,
                                                    &waiting, "s", sd_bus_message_get_sender(call));
        if (result < 0) {
            pending.pop_back();
            return result;
        }
        waiting.question.reset(slot);
        return 1; // the answer comes later
    }

    static int identified(sd_bus_message* answer, void* waiting, sd_bus_error* /*error*/) {
        auto& one = *static_cast<Pending*>(waiting);
        State& state = one.state;
        std::optional<PeerProcess> peer;
        if (sd_bus_message_is_method_error(answer, nullptr) == 0)
            peer = readPeer(answer);
        state.finish(one, peer);
        state.pending.erase(one.place);
        return 0;
    }

    void finish(Pending& one, const std::optional<PeerProcess>& peer) const {
        if (!peer || peer->user() != ::geteuid()) {
            platformLog(LogLevel::warning, "A request of somebody unknown was not heard");
            sd_bus_reply_method_errorf(one.call.get(), SD_BUS_ERROR_ACCESS_DENIED,
                                       "The caller is unknown");
            return;
        }
        one.request.source = identityOf(*peer, callers);
        if (const Failure failure = take(std::move(one.request)))
            sd_bus_reply_method_errorf(one.call.get(), SD_BUS_ERROR_LIMITS_EXCEEDED, "%s",
                                       failure->localizedDescription.value_or("").c_str());
        else
            sd_bus_reply_method_return(one.call.get(), "");
    }
};

InstanceBus::InstanceBus(EventThread& thread, const SingleInstance::Options& options,
                         RequestTaker take)
    : state_(new State{options.callers, std::move(take), nullptr, nullptr, Standing::away, {}}) {
    state_->start(thread, options);
}

InstanceBus::~InstanceBus() = default;

InstanceBus::Standing InstanceBus::standing() const {
    return state_->standing;
}

Result<bool> handToBus(const SingleInstance::Options& options, const OpenRequest& request) {
    const Bus bus = connectToBus(options.busAddress, options.patience);
    const std::string path = busPathOf(applicationIdentifier);
    sd_bus_message* made = nullptr;
    if (!bus || sd_bus_message_new_method_call(
                    bus.get(), &made, std::string(applicationIdentifier).c_str(), path.c_str(),
                    applicationInterface, request.urls.empty() ? "Activate" : "Open") < 0)
        return false;
    const BusMessage call(made);
    sd_bus_message_set_auto_start(made, 0);
    if (!request.urls.empty()) {
        sd_bus_message_open_container(made, 'a', "s");
        for (const std::string& url : request.urls)
            // What is no UTF-8 cannot travel here; the socket would have taken it.
            if (sd_bus_message_append(made, "s", url.c_str()) < 0)
                return makeErrorWithText(ErrorCode::invalidArgument,
                                         localized("The request is damaged and was not taken."));
        sd_bus_message_close_container(made);
    }
    sd_bus_message_append(made, "a{sv}", request.activationToken.empty() ? 0 : 1, tokenKey, "s",
                          request.activationToken.c_str());
    BusError error;
    const int result = sd_bus_call(bus.get(), made, 0, error.get(), nullptr);
    if (result >= 0)
        return true;
    if (error.is(SD_BUS_ERROR_SERVICE_UNKNOWN) || error.is(SD_BUS_ERROR_NAME_HAS_NO_OWNER) ||
        result == -ENOTCONN || result == -ECONNRESET)
        return false;
    return makeErrorWithText(result == -ETIMEDOUT ? ErrorCode::timedOut
                                                  : ErrorCode::invalidArgument,
                             localizedFormat("Tavrin runs already, but did not take the request: "
                                             "%1$@",
                                             error.text()));
}

} // namespace platform
