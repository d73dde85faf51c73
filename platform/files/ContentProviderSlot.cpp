#include "platform/files/ContentProviderSlot.h"

#include <utility>

namespace platform {

/// Stands for one call into the provider.
class ContentProviderSlot::Use {
public:
    explicit Use(ContentProviderSlot& slot, CancelFlag* cancel = nullptr)
        : slot_(slot), cancel_(cancel) {
        const std::lock_guard lock(slot.mutex_);
        provider_ = slot.provider_;
        if (!provider_)
            return;
        ++slot.users_;
        if (cancel_)
            slot.fetching_.push_back(cancel_);
    }
    ~Use() {
        if (!provider_)
            return;
        const std::lock_guard lock(slot_.mutex_);
        std::erase(slot_.fetching_, cancel_);
        if (--slot_.users_ == 0)
            slot_.unused_.notify_all();
    }
    Use(const Use&) = delete;
    Use& operator=(const Use&) = delete;

    ContentProvider* provider() const { return provider_; }

private:
    ContentProviderSlot& slot_;
    CancelFlag* cancel_;
    ContentProvider* provider_ = nullptr;
};

ContentProviderSlot& ContentProviderSlot::shared() {
    static ContentProviderSlot* const slot = new ContentProviderSlot(); // never goes
    return *slot;
}

void ContentProviderSlot::set(ContentProvider* provider) {
    std::unique_lock lock(mutex_);
    if (std::exchange(provider_, provider) == provider)
        return;
    // Who fetches stays listed until he has let go of the lock, so the flags are alive here.
    for (CancelFlag* flag : fetching_)
        flag->cancel();
    unused_.wait(lock, [this] { return users_ == 0; });
}

ContentProvider* ContentProviderSlot::get() const {
    const std::lock_guard lock(mutex_);
    return provider_;
}

bool ContentProviderSlot::isPromised(const Url& item) {
    const Use use(*this);
    return use.provider() && use.provider()->isPromised(item);
}

Failure ContentProviderSlot::makeLocal(const Url& item, CancelFlag& cancel) {
    const Use use(*this, &cancel);
    return use.provider() ? use.provider()->makeLocal(item, cancel) : std::nullopt;
}

} // namespace platform
