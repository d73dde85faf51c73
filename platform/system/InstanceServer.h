#pragma once

#include "platform/files/FileDescriptor.h"
#include "platform/system/SingleInstance.h"

#include <functional>
#include <memory>

namespace platform {

class EventThread;

/// Takes a request in; an error says why not.
using RequestTaker = std::function<Failure(OpenRequest request)>;

/// Serves the socket of the running instance: several callers at a time, each with one request and
/// not for ever. Lives on the event thread, which makes and destroys it.
class InstanceServer {
public:
    InstanceServer(EventThread& thread, FileDescriptor listener, KnownCallers callers,
                   Duration patience, RequestTaker take);
    ~InstanceServer();
    InstanceServer(const InstanceServer&) = delete;
    InstanceServer& operator=(const InstanceServer&) = delete;

private:
    struct State;
    std::unique_ptr<State> state_;
};

} // namespace platform
