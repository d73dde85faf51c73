#pragma once

#include <functional>
#include <memory>

namespace platform {

class EventThread;

/// Whether the machine's connection is a mobile or a metered one, as NetworkManager says; not
/// where it does not run. Lives on the event thread, which makes and destroys it.
class MeteredConnection {
public:
    /// `changed` is called on the event thread, each time the answer has changed.
    MeteredConnection(EventThread& thread, std::function<void(bool cellular)> changed);
    ~MeteredConnection();
    MeteredConnection(const MeteredConnection&) = delete;
    MeteredConnection& operator=(const MeteredConnection&) = delete;

private:
    struct State;
    std::unique_ptr<State> state_;
};

} // namespace platform
