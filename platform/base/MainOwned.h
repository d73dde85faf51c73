#pragma once

#include "platform/base/Runtime.h"

#include <memory>
#include <utility>

namespace platform {

/// A strong reference to an object of the main thread, held for a moment by another thread: when it
/// may be the last one, the object is released on the main queue, not here.
template<class T>
class MainOwned {
public:
    MainOwned() = default;
    explicit MainOwned(std::shared_ptr<T> object) : object_(std::move(object)) {}
    ~MainOwned() { release(); }
    MainOwned(MainOwned&& other) noexcept = default;
    MainOwned& operator=(MainOwned&& other) noexcept {
        release();
        object_ = std::move(other.object_);
        return *this;
    }

    T* operator->() const { return object_.get(); }
    T& operator*() const { return *object_; }
    explicit operator bool() const { return object_ != nullptr; }
    const std::shared_ptr<T>& get() const { return object_; }

private:
    void release() {
        if (!object_ || !Runtime::installed())
            return;
        MainQueue& main = Runtime::current().mainQueue;
        if (!main.isMainThread())
            main.async([object = std::move(object_)] {});
    }

    std::shared_ptr<T> object_;
};

template<class T>
MainOwned<T> lockForMain(const std::weak_ptr<T>& weak) {
    return MainOwned<T>(weak.lock());
}

} // namespace platform
