#pragma once

#include "platform/files/ContentProvider.h"

#include <condition_variable>
#include <vector>

namespace platform {

/// Holds the process's content provider and keeps it from being replaced while it is in use: set()
/// cancels what the old one fetches and waits until nobody is inside it. Safe from any thread.
class ContentProviderSlot {
public:
    static ContentProviderSlot& shared();

    void set(ContentProvider* provider);
    ContentProvider* get() const;

    /// False without a provider.
    bool isPromised(const Url& item);
    /// Success without a provider: then there are no promises.
    Failure makeLocal(const Url& item, CancelFlag& cancel);

private:
    class Use;

    mutable std::mutex mutex_;
    std::condition_variable unused_;
    ContentProvider* provider_ = nullptr;
    int users_ = 0;
    std::vector<CancelFlag*> fetching_;
};

} // namespace platform
