#include "platform/files/Progress.h"

#include "platform/base/Describe.h"
#include "platform/files/ProgressCallback.h"

#include <algorithm>

namespace platform {

double Progress::fractionCompleted() const {
    const std::int64_t total = totalUnitCount();
    if (total <= 0)
        return 0;
    return static_cast<double>(completedUnitCount()) / static_cast<double>(total);
}

void Progress::update(std::int64_t completed, std::int64_t total) {
    const std::lock_guard lock(mutex_);
    completed_.store(completed, std::memory_order_relaxed);
    total_.store(total, std::memory_order_relaxed);
    // An observer may add and remove observers, also itself: a copy is walked, and whoever is not
    // in the list any more is left out.
    const auto observers = observers_;
    const ProgressCallbackScope inCallback;
    for (const auto& [id, observer] : observers) {
        const bool listed = std::any_of(observers_.begin(), observers_.end(),
                                        [&](const auto& one) { return one.first == id; });
        if (listed)
            (*observer)(*this);
    }
}

Progress::ObserverId Progress::addObserver(Observer observer) {
    const std::lock_guard lock(mutex_);
    observers_.emplace_back(++lastId_, std::make_shared<Observer>(std::move(observer)));
    return lastId_;
}

void Progress::removeObserver(ObserverId id) {
    std::shared_ptr<Observer> removed; // what it holds is released outside the lock
    const std::lock_guard lock(mutex_);
    const auto found = std::find_if(observers_.begin(), observers_.end(),
                                    [&](const auto& one) { return one.first == id; });
    if (found == observers_.end())
        return;
    removed = std::move(found->second);
    observers_.erase(found);
}

void appendDescription(std::string& out, const Progress& progress) {
    out += progress.kind() + ' ';
    describe(out, progress.completedUnitCount());
    out += " of ";
    describe(out, progress.totalUnitCount());
}

} // namespace platform
