#pragma once

#include <mutex>
#include <optional>
#include <utility>
#include <vector>

namespace platform {

/// What the main thread wants from a worker, best first; the worker looks before each piece of
/// work, so that what is out of view again is never done.
template<class Wish>
class LatestWishes {
public:
    void set(std::vector<Wish> wishes) {
        const std::lock_guard lock(mutex_);
        wanted_ = std::move(wishes);
    }
    bool isEmpty() const {
        const std::lock_guard lock(mutex_);
        return wanted_.empty();
    }
    std::optional<Wish> take() {
        const std::lock_guard lock(mutex_);
        if (wanted_.empty())
            return std::nullopt;
        Wish first = std::move(wanted_.front());
        wanted_.erase(wanted_.begin());
        return first;
    }

private:
    mutable std::mutex mutex_;
    std::vector<Wish> wanted_;
};

} // namespace platform
