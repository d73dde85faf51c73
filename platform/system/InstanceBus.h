#pragma once

#include "platform/system/InstanceServer.h"

#include <memory>

namespace platform {

/// The running instance on the session bus: the application's name, and org.freedesktop.Application
/// at the path that belongs to it. Lives on the event thread, which makes and destroys it.
class InstanceBus {
public:
    enum class Standing {
        /// There is no bus, or it does not answer.
        away,
        /// The name is ours.
        owner,
        /// The name is another process's.
        taken
    };
    InstanceBus(EventThread& thread, const SingleInstance::Options& options, RequestTaker take);
    ~InstanceBus();
    InstanceBus(const InstanceBus&) = delete;
    InstanceBus& operator=(const InstanceBus&) = delete;

    Standing standing() const;

private:
    struct State;
    std::unique_ptr<State> state_;
};

/// Hands a request to whoever owns the application's name. False when nobody does, or there is no
/// bus. Blocks, at most as long as the options' patience.
Result<bool> handToBus(const SingleInstance::Options& options, const OpenRequest& request);

} // namespace platform
