#include "platform/base/NotificationCenter.h"

#include <algorithm>
#include <map>
#include <mutex>
#include <string>
#include <vector>

namespace platform {

struct NotificationCenter::State {
    std::mutex mutex;
    std::map<std::string, std::vector<std::weak_ptr<Handler>>, std::less<>> observers;
};

NotificationCenter::NotificationCenter() : state_(std::make_unique<State>()) {
}
NotificationCenter::~NotificationCenter() = default;

Observation NotificationCenter::observe(std::string_view name, Handler handler) {
    auto entry = std::make_shared<Handler>(std::move(handler));
    const std::lock_guard lock(state_->mutex);
    auto found = state_->observers.find(name);
    if (found == state_->observers.end())
        found = state_->observers.try_emplace(std::string(name)).first;
    std::erase_if(found->second, [](const auto& weak) { return weak.expired(); });
    found->second.push_back(entry);
    return Observation(std::move(entry));
}

void NotificationCenter::post(std::string_view name, const Value& info) {
    std::vector<std::weak_ptr<Handler>> called;
    {
        const std::lock_guard lock(state_->mutex);
        if (const auto found = state_->observers.find(name); found != state_->observers.end())
            called = found->second;
    }
    const Notification notification{name, info};
    for (const std::weak_ptr<Handler>& weak : called)
        if (const auto handler = weak.lock())
            (*handler)(notification);
}

} // namespace platform
