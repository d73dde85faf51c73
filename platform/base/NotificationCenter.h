#pragma once

#include "platform/base/Value.h"

#include <functional>
#include <memory>
#include <string_view>

namespace platform {

struct Notification {
    std::string_view name;
    Value info;
};

/// Ends an observation when it goes away. Default-made: holds none.
class Observation {
public:
    Observation() = default;
    explicit Observation(std::shared_ptr<void> entry) : entry_(std::move(entry)) {}
    void end() { entry_.reset(); }
    explicit operator bool() const { return entry_ != nullptr; }

private:
    std::shared_ptr<void> entry_;
};

/// Names to handlers. A handler runs on the thread that posts, in the order of registration, and
/// not any more once its Observation has ended on that same thread. Safe from any thread.
class NotificationCenter {
public:
    using Handler = std::function<void(const Notification&)>;

    NotificationCenter();
    ~NotificationCenter();
    NotificationCenter(const NotificationCenter&) = delete;
    NotificationCenter& operator=(const NotificationCenter&) = delete;

    [[nodiscard]] Observation observe(std::string_view name, Handler handler);
    void post(std::string_view name, const Value& info = {});

private:
    struct State;
    std::unique_ptr<State> state_;
};

} // namespace platform
